#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Finds entry points that cannot be used: their file is not in the project, is not on disk or has another
/// entry point, or their group does not exist.
///
/// It reads the store, because the manager leaves out some of these entry points and fails on others.
class EntryPointCheck {
public:
    /// @param shown for the paths in findings, borrowed.
    EntryPointCheck(OpenProject& project, ShownPaths& shown) : project_(project), shown_(shown) {}

    /// The caller holds a guard of the store.
    Findings run();

private:
    using Node = project::metadata::MetadataNode;

    using Address = project::metadata::MetadataPath;

    void check(Address const& address, Node const& node);
    void checkFile(std::string const& entry, std::u16string const& file, Address const& address);
    void add(Finding finding, Address const& address, std::u16string const& file);

    OpenProject& project_;
    ShownPaths& shown_;
    std::set<std::u16string> groups_;                      ///< UUIDs
    std::map<std::u16string, std::vector<Address>> files_; ///< the entry points of each file
    Findings findings_;
};

} // namespace projectctl

#pragma once

#include <map>
#include <set>
#include <string>

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

    void check(std::u16string const& uuid, Node const& node);
    void checkFile(std::string const& entry, std::u16string const& file);

    OpenProject& project_;
    ShownPaths& shown_;
    std::set<std::u16string> groups_;             ///< UUIDs
    std::map<std::u16string, std::size_t> files_; ///< how many entry points each file has
    Findings findings_;
};

} // namespace projectctl

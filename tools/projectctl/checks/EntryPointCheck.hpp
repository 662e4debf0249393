#pragma once

#include <map>
#include <set>
#include <string>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// What is stored of entry points and cannot be followed: files that are not in the project or gone from the
/// disk, groups that are gone, and files that are an entry point twice.
///
/// It reads the store, since the manager's own list leaves out some of these and ends at others.
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

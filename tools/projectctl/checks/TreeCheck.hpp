#pragma once

#include <string>

#include "checks/Finding.hpp"
#include "checks/LabelCheck.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Searches the whole tree of a project for nodes that the managers fail on or silently ignore.
///
/// It reads the store and not the managers' lists, because these fail on the first fault.
class TreeCheck {
public:
    /// Takes the store's read guard and holds it, so that all findings are about one state of the project.
    /// @param shown for the paths in findings.
    TreeCheck(OpenProject& project, ShownPaths shown);

    /// Makes all checks. Call it once.
    Findings run();

private:
    using Address = project::metadata::MetadataPath;

    void checkHead(Address const& head);
    void checkFiles(Address const& scope);
    void checkFile(Address const& file);
    void checkCategories(Address const& head);
    void checkLabels(Address const& category);
    void checkEntryPoints(Address const& head);
    void checkGroups(Address const& head);
    void checkReferences(Address const& head);
    /// @param message for an address without a node.
    bool requireNode(Address const& address, char const* message);
    void add(Finding finding, Address const& address);

    OpenProject& project_;
    project::metadata::MetadataManager& store_; ///< the project's
    cmlink::ReentrantReadWriteLock::LockGuard guard_;
    LabelCheck labels_;
    ShownPaths shown_;
    Findings findings_;
};

} // namespace projectctl

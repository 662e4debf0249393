#pragma once

#include <string>

#include "checks/Finding.hpp"
#include "checks/LabelCheck.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Looks through the whole tree of a project for what the managers would stumble over or pass by in silence.
///
/// It reads the store and not the managers' lists, since those end at the first fault.
class TreeCheck {
public:
    /// Takes the store's read guard and keeps it, so that all of it is one state of the project.
    explicit TreeCheck(OpenProject& project);

    /// All that is found. To be called once.
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
    bool requireNode(Address const& address, std::string const& what);
    void fault(std::string text);
    void note(std::string text);

    OpenProject& project_;
    project::metadata::MetadataManager& store_; ///< the project's
    cmlink::ReentrantReadWriteLock::LockGuard guard_;
    LabelCheck labels_;
    ShownPaths shown_;
    Findings findings_;
};

} // namespace projectctl

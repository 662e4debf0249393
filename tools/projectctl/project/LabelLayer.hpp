#pragma once

#include <optional>
#include <string>

#include "project/OpenProject.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/session/Query.hpp"

namespace projectctl {

/// The categories and labels of one layer of a project: those of the project, or those of the person who
/// works in the folder.
class LabelLayer {
public:
    /// @param project borrowed.
    LabelLayer(OpenProject& project, bool isPersonal) : project_(&project), isPersonal_(isPersonal) {}

    bool isPersonal() const noexcept { return isPersonal_; }

    project::management::LabelManager& labels() const;

    /// The files of the project, with the labels of this layer.
    project::management::FileManager& files() const;

    /// Whether a category of the layer has this name, or this UUID. @param name bytes of an argument.
    bool hasCategory(std::string const& name) const;

    /// A guard for a search for names and the change that follows it.
    class Guard {
    public:
        explicit Guard(LabelLayer const& layer);

    private:
        cmlink::ReentrantReadWriteLock::LockGuard project_;
        std::optional<cmlink::ReentrantReadWriteLock::LockGuard> personal_; ///< taken after the project's
    };

private:
    OpenProject* project_;
    bool isPersonal_;
};

} // namespace projectctl

#pragma once

#include <map>
#include <memory>
#include <vector>

#include "PersonalSteps.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/decorators/EventBroadcastingProjectManager.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"
#include "project/stores/PathMoves.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// The personal text of a project, with managers over it. Its file list contains the files that have personal
/// labels and the folders above them, so that it reads like any project's text.
///
/// Changes are made in a step that takes part in it, see PersonalSteps.
class PersonalStore {
public:
    /// Nothing is read or written. @param root of the project, canonical.
    explicit PersonalStore(Path root);

    Path const& root() const noexcept { return root_; }

    std::shared_ptr<stores::TreeMetadataManager> const& tree() const noexcept { return tree_; }

    stores::TextBackend& text() noexcept { return *text_; }

    PersonalSteps& steps() noexcept { return steps_; }

    /// Managers whose events go to the steps.
    management::ProjectManager& managers() noexcept { return managers_; }

    /// The files and folders of the text in Path order, also those without labels of their own.
    std::vector<Path> files();

    bool contains(Path const& file);

    /// Those of some files that the text contains.
    std::vector<Path> containedIn(std::vector<Path> const& files);

    /// The files that have labels or data, in Path order.
    std::vector<Path> labelledFiles();

    /// Adds files, with the folders above them, as far as the text does not contain them.
    void add(std::vector<Path> const& files);

    /// Deletes files with everything below them, and the folders above them that are no longer needed.
    /// Files that the text does not contain are skipped.
    void remove(std::vector<Path> const& files);

    /// Whether the text contains a file or folder that moves.
    bool concerns(stores::PathMoves const& moves);

    /// Moves files with everything below them to their new paths, in place of files that have left the
    /// project.
    void move(stores::PathMoves const& moves);

    /// Deletes those of these files, and of the folders above them, that have no labels and no data, and
    /// nothing below them.
    void removeUnlabelled(std::vector<Path> const& files);

private:
    class FolderIgnorer;

    std::unique_ptr<stores::Backend> makeBackend();
    void loadBelow(metadata::MetadataPath const& head,
                   std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>>& nodes);
    Path pathOf(metadata::MetadataPath const& address) const;
    bool isNeeded(metadata::MetadataPath const& address);

    Path const root_;
    stores::TextBackend* text_ = nullptr; ///< owned by the tree
    std::shared_ptr<stores::TreeMetadataManager> const tree_;
    std::shared_ptr<metadata::FileChangeRequestListener> const ignorer_; ///< the tree has a weak pointer
    PersonalSteps steps_;
    management::ProjectManagerBase base_;
    management::EventBroadcastingProjectManager managers_;
};

} // namespace project::session

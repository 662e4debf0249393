#pragma once

#include <memory>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "project/metadata/MetadataManager.hpp"
#include "project/stores/Change.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Keeps the project's text in git's index up to date. CMAwareProjectManager stages files that are added or
/// removed; the text merely changes. A commit must not contain a file without its entry in the text.
class DefinitionStager {
public:
    /// @param store the store whose writes make staging necessary; borrowed.
    /// @param adapter borrowed.
    /// @param text the file to stage.
    DefinitionStager(metadata::MetadataManager& store, cmlink::CMAdapter& adapter, Path text);

    /// Stages the text if the store was written since the text was last staged, and source control tracks
    /// it. If that fails, the text remains due. Takes the write lock: only one thread at a time may use an
    /// adapter.
    void stageIfWritten();

    /// Stages those of these files whose removal is staged: files that were removed from the project and
    /// are now added again. CMActionManager adds only files that git does not know, and git knows these.
    /// Call it with a guard of the store held.
    void stageReturned(std::vector<Path> const& files);

    /// Stages that the file of the definition was replaced by another one, if git tracks the old one.
    void stageReplaced(stores::FileChanges const& files);

    /// Counts as a write of the store.
    void noteWritten() noexcept;

    /// Whether the store was written since the text was last staged.
    bool isDue() const noexcept;

private:
    class WriteWatch;

    metadata::MetadataManager& store_;
    cmlink::CMAdapter& adapter_;
    Path text_;
    std::shared_ptr<WriteWatch> watch_; ///< the store holds only a weak pointer
};

} // namespace project::session

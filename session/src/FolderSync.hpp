#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "ChangeExecutor.hpp"
#include "EventQueue.hpp"
#include "project/core/ProjectManager.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/git/GitEnvironment.hpp"
#include "project/session/Renames.hpp"
#include "project/session/Sync.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// The folders of a session's project that keep themselves up to date.
class FolderSync {
public:
    /// All are borrowed.
    FolderSync(Path const& root, git::GitEnvironment environment, stores::TreeMetadataManager& store,
               management::ProjectManager& project, ChangeExecutor& executor, EventQueue& raised);

    /// As Session::setSyncRule.
    void set(SyncRule const& rule);

    /// As Session::removeSyncRule.
    bool remove(Path const& folder);

    /// As Session::planSync.
    SyncPlan plan();

    /// As Session::findRenames.
    /// @param writer as RenameSearch needs it.
    RenamesFound findRenames(RenameOptions const& options, Path const& writer);

    /// Those of some renames that a synchronisation follows, as SyncPlan::renamed describes.
    std::vector<Move> followed(RenamesFound const& renames, SyncPlan const& plan) const;

    /// Makes the changes of a plan. Call it in the transaction in which the plan was made.
    void apply(SyncPlan const& plan, SyncOptions const& options);

private:
    std::unique_ptr<management::FileMetadataManager> rules();
    void change(std::function<void()> const& operation);

    Path const& root_;
    git::GitEnvironment environment_;
    stores::TreeMetadataManager& store_;
    management::ProjectManager& project_;
    ChangeExecutor& executor_;
    EventQueue& raised_;
};

} // namespace project::session

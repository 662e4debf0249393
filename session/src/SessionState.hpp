#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <vector>

#include "ChangeExecutor.hpp"
#include "DefinitionStager.hpp"
#include "EventQueue.hpp"
#include "FolderSync.hpp"
#include "OpenMoves.hpp"
#include "OthersEvents.hpp"
#include "PersonalLayer.hpp"
#include "PersonalStore.hpp"
#include "SessionStore.hpp"
#include "TransactionFiles.hpp"
#include "project/cm/CMAwareProjectManager.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/session.hpp"

namespace project::session {

/// The stack of a session. Members are destroyed in reverse order: the outermost manager first, the store
/// last.
class Session::State {
public:
    State(Path const& folder, Options options);
    ~State();

    /// The managers between the store and the session's own.
    struct Managers {
        std::unique_ptr<management::ProjectManager> outermost;      ///< until the session's own has it
        management::CMAwareProjectManager* sourceControl = nullptr; ///< one of them; null if it is off
    };

    /// @throws StoreError if the folder does not contain a text.
    void requireProject() const;

    /// Creates the project if the store is empty. @return false if there is a project, perhaps one that
    /// another process has created at the same time.
    bool createProject(std::u16string const& name);

    void stage();

    /// Stages files of the store that the session has created.
    void stageNew(std::vector<Path> const& files);

    std::vector<Move> move(std::vector<Path> const& sources, Path const& destination);
    void adopt(std::vector<Move> const& moves);

    bool refresh();

    /// Waits until others may have changed a shared project, or the time has run out, or wake was called.
    /// @return false if wake was called.
    bool awaitChange(std::chrono::milliseconds time);

    void wake() noexcept;

    Path const root;
    Path const storeFolder;
    std::unique_ptr<git::GitAdapter> adapter; ///< null if source control is off
    SessionStore stored;
    std::shared_ptr<stores::TreeMetadataManager> const store; ///< of stored
    std::unique_ptr<DefinitionStager> stager;                 ///< null if source control is off
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> events;
    EventQueue raised; ///< by the managers
    Managers managers;
    TransactionFiles files;
    PersonalStore personalStore;
    OpenMoves moves;
    ChangeExecutor executor;
    std::unique_ptr<management::ProjectManager> project;
    PersonalLayer personal;
    FolderSync sync;

private:
    std::unique_ptr<DefinitionStager> makeStager();
    Managers makeManagers();
    bool isStoreEmpty() const;
    std::string definitionState() const;
    void followInOthers(std::vector<Move> const& made, Options const& options, bool isRepeated) const;
    void raiseEventsOf(stores::Changes const& changes);
    void movePersonal(stores::PathMoves const& moved);
    void completePersonal(std::vector<Move> const& made);
    ChangedFiles listedFilesOf(std::vector<Move> const& moves) const;

    std::mutex wakingMutex_;
    std::condition_variable waking_;
    std::atomic<bool> isWoken_ = false;
    OthersEvents ofOthers_; ///< to be dispatched by refresh
};

} // namespace project::session

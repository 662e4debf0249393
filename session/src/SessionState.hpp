#pragma once

#include <deque>
#include <memory>
#include <mutex>
#include <optional>

#include "ChangeExecutor.hpp"
#include "DefinitionStager.hpp"
#include "EventQueue.hpp"
#include "TransactionFiles.hpp"
#include "project/cm/CMAwareProjectManager.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/session.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The stack of a session. Members are destroyed in reverse order: the outermost manager first, the store
/// last.
class Session::State {
public:
    State(Path const& folder, Options options);

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
    bool refresh();

    Path const root;
    stores::TextBackend* text;                ///< owned by the store
    std::unique_ptr<git::GitAdapter> adapter; ///< null if source control is off
    std::shared_ptr<stores::TreeMetadataManager> store;
    std::unique_ptr<DefinitionStager> stager; ///< null if source control is off
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> events;
    EventQueue raised; ///< by the managers
    Managers managers;
    TransactionFiles files;
    ChangeExecutor executor;
    std::unique_ptr<management::ProjectManager> project;

private:
    std::shared_ptr<stores::TreeMetadataManager> makeStore(Options options);
    std::unique_ptr<DefinitionStager> makeStager();
    Managers makeManagers();
    bool isStoreEmpty() const;
    void queueEventsOfOthers();
    std::optional<Event> nextEventOfOthers();

    std::mutex eventsOfOthersMutex_;
    std::deque<Event> eventsOfOthers_; ///< to be dispatched by refresh
};

} // namespace project::session

#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <type_traits>
#include <utility>
#include <vector>

#include "EventQueue.hpp"
#include "OpenMoves.hpp"
#include "PersonalSteps.hpp"
#include "TransactionFiles.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

class DefinitionStager;

/// Runs every change that an application makes through a session. A change is a step: an operation, or a
/// transaction, in which the operations are nested steps. See ChangeStep.
class ChangeExecutor {
public:
    /// @param store borrowed, as are the adapter, the stager, the files and the queue.
    /// @param adapter null if source control is off.
    /// @param stager null if the text is not staged after each change.
    /// @param raised the queue of the events that the managers raise.
    /// @param observers the broadcaster to dispatch these events on.
    /// @param personal the personal part of the steps, with the broadcaster for its events; may be null.
    /// @param moves the moves on disk of the steps; null if there are none.
    ChangeExecutor(
        stores::TreeMetadataManager& store, git::GitAdapter* adapter, DefinitionStager* stager,
        TransactionFiles& files, EventQueue& raised,
        std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers,
        PersonalSteps* personal = nullptr,
        std::shared_ptr<management::DispatchableProjectEventBroadcaster> personalObservers = nullptr,
        OpenMoves* moves = nullptr);

    /// Runs one operation as a step.
    /// @param files the files that the operation adds to the project or removes from it.
    /// @return the result of the operation.
    /// @throws the exception of the operation or of ChangeStep::commit.
    template <typename Operation>
    auto execute(Operation const& operation, ChangedFiles const& files = {}) {
        if constexpr (std::is_void_v<decltype(operation())>) {
            run(operation, files);
        } else {
            std::optional<decltype(operation())> result;
            run([&] { result = operation(); }, files);
            return *std::move(result);
        }
    }

    /// Whether a step is open. The caller holds a guard of the store: the step is one of its own thread then.
    bool isInStep() const noexcept { return openSteps_ > 0; }

    /// Lets the open steps take part in the personal text, before a personal change in them.
    void joinPersonal() { personal_->join(openSteps_); }

    /// Lets the personal text follow a change of the project, in the open steps. A personal text that cannot
    /// be read or locked must not prevent the change: its error is thrown when the change is committed.
    /// @param isConcerned whether there is something to change.
    void changePersonal(std::function<bool()> const& isConcerned, std::function<void()> const& change);

    /// The broadcaster for the events of the personal text.
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> const&
    personalObservers() const noexcept {
        return personalObservers_;
    }

private:
    friend class ChangeStep;

    void run(std::function<void()> const& operation, ChangedFiles const& files);
    void stage(git::GitAdapter::Batch* batch);
    void stageText(std::vector<Path> const& added);
    void publish(git::GitAdapter::Batch& batch);
    void recoverMoves();
    void stageMoves();
    void commitMoves() noexcept;
    void finishMoves() noexcept;

    stores::TreeMetadataManager& store_;
    git::GitAdapter* adapter_;
    DefinitionStager* stager_;
    TransactionFiles& files_;
    EventQueue& raised_;
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers_;
    PersonalSteps* personal_;
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> personalObservers_;
    OpenMoves* moves_;
    std::size_t openSteps_ = 0;
};

} // namespace project::session

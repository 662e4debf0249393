#include "ChangeExecutor.hpp"

#include <exception>

#include "ChangeStep.hpp"
#include "DefinitionStager.hpp"
#include "project/stores/StoreError.hpp"

namespace project::session {

ChangeExecutor::ChangeExecutor(
    stores::TreeMetadataManager& store, git::GitAdapter* adapter, DefinitionStager* stager,
    TransactionFiles& files, EventQueue& raised,
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers, PersonalSteps* personal,
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> personalObservers, OpenMoves* moves)
    : store_(store),
      adapter_(adapter),
      stager_(stager),
      files_(files),
      raised_(raised),
      observers_(std::move(observers)),
      personal_(personal),
      personalObservers_(std::move(personalObservers)),

      moves_(moves) {
}

void ChangeExecutor::run(std::function<void()> const& operation, ChangedFiles const& files) {
    ChangeStep step(*this, ChangeStep::Kind::Operation);
    operation();
    files_.add(files);
    step.commit();
}

void ChangeExecutor::changePersonal(std::function<bool()> const& isConcerned,
                                    std::function<void()> const& change) {
    try {
        if (isConcerned()) {
            joinPersonal();
            change();
        }
    } catch (stores::StoreError const&) {
        personal_->keepError(std::current_exception());
    }
}

/// Stages the files and the text of a step that is committed. If the text cannot be staged, the files are
/// staged all the same: they are in the project.
void ChangeExecutor::stage(git::GitAdapter::Batch* batch) {
    auto const added = files_.takeAdded();
    if (batch == nullptr) {
        finishMoves();
        return;
    }
    try {
        stageText(added);
    } catch (...) {
        publish(*batch);
        throw;
    }
    publish(*batch);
    if (stager_ != nullptr) { // otherwise Session::stage ends the moves
        finishMoves();
    }
}

void ChangeExecutor::finishMoves() noexcept {
    if (moves_ != nullptr) {
        moves_->finish();
    }
}

void ChangeExecutor::stageMoves() {
    if (moves_ != nullptr) {
        moves_->stage();
    }
}

void ChangeExecutor::commitMoves() noexcept {
    if (moves_ != nullptr) {
        moves_->commit();
    }
}

/// Completes or rolls back the moves of a process that has died.
void ChangeExecutor::recoverMoves() {
    if (moves_ != nullptr && moves_->recover() && stager_ != nullptr) {
        stager_->noteWritten();
    }
}

void ChangeExecutor::stageText(std::vector<Path> const& added) {
    if (stager_ != nullptr) {
        if (!added.empty()) {
            stager_->stageReturned(added);
        }
        stager_->stageIfWritten();
    }
}

void ChangeExecutor::publish(git::GitAdapter::Batch& batch) {
    try {
        batch.publish();
    } catch (...) {
        if (stager_ != nullptr) {
            stager_->noteWritten(); // the text is not staged after all
        }
        throw;
    }
}

} // namespace project::session

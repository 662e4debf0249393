#include "ChangeExecutor.hpp"

#include "ChangeStep.hpp"
#include "DefinitionStager.hpp"

namespace project::session {

ChangeExecutor::ChangeExecutor(stores::TreeMetadataManager& store, DefinitionStager* stager,
                               TransactionFiles& files, EventQueue& raised,
                               std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers)
    : store_(store), stager_(stager), files_(files), raised_(raised), observers_(std::move(observers)) {
}

void ChangeExecutor::run(std::function<void()> const& operation, ChangedFiles const& files) {
    ChangeStep step(*this, ChangeStep::Kind::Operation);
    operation();
    files_.add(files);
    step.commit();
}

void ChangeExecutor::stage() {
    auto const added = files_.takeAdded();
    if (stager_ != nullptr) {
        if (!added.empty()) {
            stager_->stageReturned(added);
        }
        stager_->stageIfWritten();
    }
}

void ChangeExecutor::dispatch(std::vector<Event> const& events) {
    for (auto const& event : events) {
        event(*observers_);
    }
}

} // namespace project::session

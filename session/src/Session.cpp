#include "project/session.hpp"

#include <utility>

#include "ChangeStep.hpp"
#include "SessionState.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/stores/StoreError.hpp"

namespace project::session {

Session Session::open(Path const& root, Options options) {
    Session result(std::make_unique<State>(root, options));
    result.state_->requireProject();
    return result;
}

Session Session::create(Path const& root, std::u16string const& name, Options options) {
    Session result(std::make_unique<State>(root, options));
    if (!result.state_->createProject(name)) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, fl::i18n::toUtf8(result.root().native()),
                                 0, "there is a project in this folder already",
                                 "Open it, or choose another folder.");
    }
    return result;
}

Session Session::openOrCreate(Path const& root, std::u16string const& name, Options options) {
    Session result(std::make_unique<State>(root, options));
    result.state_->createProject(name);
    return result;
}

Session::Session(std::unique_ptr<State> state) : state_(std::move(state)) {
}

Session::Session(Session&& other) noexcept = default;

Session& Session::operator=(Session&& other) noexcept = default;

Session::~Session() = default;

management::ProjectManager& Session::project() noexcept {
    return *state_->project;
}

Transaction Session::transaction() {
    return Transaction(std::make_unique<ChangeStep>(state_->executor, ChangeStep::Kind::Transaction));
}

std::shared_ptr<management::DispatchableProjectEventBroadcaster> const& Session::events() const noexcept {
    return state_->events;
}

Path const& Session::root() const noexcept {
    return state_->root;
}

bool Session::refresh() {
    return state_->refresh();
}

metadata::MetadataManager& Session::store() noexcept {
    return *state_->store;
}

void Session::stage() {
    state_->stage();
}

} // namespace project::session

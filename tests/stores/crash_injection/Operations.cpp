#include "Operations.hpp"

#include <algorithm>

namespace project::test {

namespace {

std::vector<History> const withoutStore{History::NoStore, History::EmptyFolder, History::HalfMadeStore};
std::vector<History> const withTail{History::LongBodyWithTail, History::LongBody};
std::vector<History> const withStore{History::LongBody,   History::ShortBody,   History::LongBodyWithTail,
                                     History::TornTail,   History::DeadWriters, History::Irregular,
                                     History::MergeJoined};

/// A process that has read the project, or has not.
std::unique_ptr<TextBackend> openPerhapsRead(Situation const& situation, Choices& choices) {
    auto backend = open(situation);
    if (choices.oneIn(2)) {
        contentOf(*backend);
    }
    return backend;
}

StoreOperation committing(Situation const& situation, std::unique_ptr<TextBackend> backend,
                          Choices& choices) {
    auto const batch = choices.batch(situation.content);
    return {std::move(backend), [batch](StoreOperation& operation) { commit(*operation.backend, batch); },
            applied(situation.content, batch)};
}

StoreOperation commitABatch(Situation& situation, Choices& choices) {
    return committing(situation, openPerhapsRead(situation, choices), choices);
}

/// A batch that is small enough to be appended to a long body.
StoreOperation appendABatch(Situation& situation, Choices& choices) {
    Batch const batch{set(fileAddress(u"appended"))};
    return {openPerhapsRead(situation, choices),
            [batch](StoreOperation& operation) { commit(*operation.backend, batch); },
            applied(situation.content, batch)};
}

StoreOperation commitAfterOthers(Situation& situation, Choices& choices) {
    auto backend = open(situation);
    contentOf(*backend);
    letAnotherWrite(situation, choices.options(), choices);
    return committing(situation, std::move(backend), choices);
}

StoreOperation commitAgain(Situation& situation, Choices& choices) {
    auto operation = commitABatch(situation, choices);
    operation.perform(operation);
    situation.content = operation.after;
    situation.notDurable.clear();
    return committing(situation, std::move(operation.backend), choices);
}

/// A writer that finds the folder locked.
StoreOperation commitWhileLocked(Situation& situation, Choices& choices) {
    auto operation = commitABatch(situation, choices);
    operation.other = std::make_unique<CrashingDisk>(situation.volume);
    operation.other->openFolder();
    operation.other->lock(std::chrono::milliseconds(1));
    operation.isRefused = true;
    return operation;
}

StoreOperation discardABatch(Situation& situation, Choices& choices) {
    auto const batch = choices.batch(situation.content);
    auto const perform = [batch](StoreOperation& operation) {
        Entered const entered(*operation.backend, Access::Write);
        try {
            operation.backend->write(batch);
        } catch (...) {
            operation.backend->discard();
            throw;
        }
        operation.backend->discard(); // as when a listener throws
    };
    return {openPerhapsRead(situation, choices), perform, situation.content};
}

StoreOperation tidyUp(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices), [](StoreOperation& operation) { operation.backend->tidy(); },
            situation.content};
}

StoreOperation closeWithATail(Situation& situation, Choices& choices) {
    auto operation = commitAgain(situation, choices);
    operation.perform = [](StoreOperation& closed) { closed.backend.reset(); };
    operation.after = situation.content;
    return operation;
}

StoreOperation repairDamage(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices),
            [](StoreOperation& operation) { operation.backend->repair(); }, situation.content};
}

StoreOperation resolveAConflict(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices),
            [text = situation.resolved](StoreOperation& operation) { operation.backend->resolve(text); },
            stores::samples::contentOf(stores::samples::readWhole(situation.resolved))};
}

StoreOperation looking(Situation const& situation, std::unique_ptr<TextBackend> backend) {
    return {std::move(backend),
            [](StoreOperation& operation) { operation.seen = contentOf(*operation.backend); },
            situation.content};
}

StoreOperation checkForChangesFirst(Situation& situation, Choices& /*choices*/) {
    return looking(situation, open(situation));
}

StoreOperation checkForChangesAgain(Situation& situation, Choices& /*choices*/) {
    auto backend = open(situation);
    contentOf(*backend);
    return looking(situation, std::move(backend));
}

StoreOperation checkForChangesAfterOthers(Situation& situation, Choices& choices) {
    auto backend = open(situation);
    contentOf(*backend);
    letAnotherWrite(situation, choices.options(), choices);
    return looking(situation, std::move(backend));
}

StoreOperation checkForFaults(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices),
            [](StoreOperation& operation) { operation.backend->check(); }, situation.content};
}

std::vector<History> everywhere() {
    auto histories = withStore;
    histories.insert(histories.end(), withoutStore.begin(), withoutStore.end());
    histories.insert(histories.end(), {History::Damaged, History::Conflict});
    return histories;
}

} // namespace

std::vector<OperationKind> const& operationKinds() {
    static std::vector<OperationKind> const kinds{
        {"append", {History::LongBody}, true, appendABatch},
        {"commit", withStore, true, commitABatch},
        {"create", withoutStore, true, commitABatch},
        {"commit after others", withStore, true, commitAfterOthers},
        {"commit again", withStore, true, commitAgain},
        {"commit while locked", withStore, false, commitWhileLocked},
        {"discard", withStore, false, discardABatch},
        {"discard creation", {History::NoStore}, false, discardABatch},
        {"discard in a folder", {History::EmptyFolder, History::HalfMadeStore}, false, discardABatch},
        {"tidy", withStore, false, tidyUp},
        {"close", withTail, false, closeWithATail},
        {"repair", {History::Damaged}, true, repairDamage},
        {"resolve", {History::Conflict}, true, resolveAConflict},
        {"first check for changes", everywhere(), false, checkForChangesFirst},
        {"check for changes again", everywhere(), false, checkForChangesAgain},
        {"check for changes after others", withStore, false, checkForChangesAfterOthers},
        {"check for faults", everywhere(), false, checkForFaults},
    };
    return kinds;
}

std::vector<OperationKind> recoveriesOf(History history) {
    OperationKind const firstCheck{"first check for changes", {}, false, checkForChangesFirst};
    switch (history) {
    case History::Damaged:
        return {{"repair", {}, true, repairDamage}, firstCheck};
    case History::Conflict:
        return {firstCheck}; // the conflict is already resolved, or resolving it was the task of the process
                             // that died
    default:
        return {{"commit", {}, true, commitABatch},
                {"commit", {}, true, commitABatch},
                {"discard", {}, false, discardABatch},
                {"tidy", {}, false, tidyUp},
                firstCheck};
    }
}

} // namespace project::test

#include "Deeds.hpp"

#include <algorithm>

namespace project::test {

namespace {

std::vector<Story> const withoutStore{Story::NoStore, Story::EmptyFolder, Story::HalfMadeStore};
std::vector<Story> const withTail{Story::LongBodyWithTail, Story::LongBody};
std::vector<Story> const withStore{Story::LongBody,   Story::ShortBody,   Story::LongBodyWithTail,
                                   Story::TornTail,   Story::DeadWriters, Story::Irregular,
                                   Story::MergeJoined};

/// A process that has read the project, or one that has not yet.
std::unique_ptr<TextBackend> openPerhapsRead(Situation const& situation, Choices& choices) {
    auto backend = open(situation);
    if (choices.oneIn(2)) {
        contentOf(*backend);
    }
    return backend;
}

Deed committing(Situation const& situation, std::unique_ptr<TextBackend> backend, Choices& choices) {
    auto const batch = choices.batch(situation.content);
    return {std::move(backend), [batch](Deed& deed) { commit(*deed.backend, batch); },
            applied(situation.content, batch)};
}

Deed commitABatch(Situation& situation, Choices& choices) {
    return committing(situation, openPerhapsRead(situation, choices), choices);
}

/// One that is surely small enough to be appended to a long body.
Deed appendABatch(Situation& situation, Choices& choices) {
    Batch const batch{set(fileAddress(u"appended"))};
    return {openPerhapsRead(situation, choices), [batch](Deed& deed) { commit(*deed.backend, batch); },
            applied(situation.content, batch)};
}

Deed commitAfterOthers(Situation& situation, Choices& choices) {
    auto backend = open(situation);
    contentOf(*backend);
    letAnotherWrite(situation, choices.options(), choices);
    return committing(situation, std::move(backend), choices);
}

Deed commitAgain(Situation& situation, Choices& choices) {
    auto deed = commitABatch(situation, choices);
    deed.perform(deed);
    situation.content = deed.after;
    situation.notDurable.clear();
    return committing(situation, std::move(deed.backend), choices);
}

/// A writer that finds the folder locked.
Deed commitWhileLocked(Situation& situation, Choices& choices) {
    auto deed = commitABatch(situation, choices);
    deed.other = std::make_unique<CrashingDisk>(situation.volume);
    deed.other->openFolder();
    deed.other->lock(std::chrono::milliseconds(1));
    deed.isRefused = true;
    return deed;
}

Deed discardABatch(Situation& situation, Choices& choices) {
    auto const batch = choices.batch(situation.content);
    auto const perform = [batch](Deed& deed) {
        Entered const entered(*deed.backend, Access::Write);
        try {
            deed.backend->write(batch);
        } catch (...) {
            deed.backend->discard();
            throw;
        }
        deed.backend->discard(); // as when a listener throws
    };
    return {openPerhapsRead(situation, choices), perform, situation.content};
}

Deed tidyUp(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices), [](Deed& deed) { deed.backend->tidy(); }, situation.content};
}

Deed closeWithATail(Situation& situation, Choices& choices) {
    auto deed = commitAgain(situation, choices);
    deed.perform = [](Deed& closed) { closed.backend.reset(); };
    deed.after = situation.content;
    return deed;
}

Deed repairDamage(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices), [](Deed& deed) { deed.backend->repair(); },
            situation.content};
}

Deed settleAConflict(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices),
            [text = situation.settled](Deed& deed) { deed.backend->resolve(text); },
            stores::samples::contentOf(stores::samples::readWhole(situation.settled))};
}

Deed looking(Situation const& situation, std::unique_ptr<TextBackend> backend) {
    return {std::move(backend), [](Deed& deed) { deed.seen = contentOf(*deed.backend); }, situation.content};
}

Deed lookForTheFirstTime(Situation& situation, Choices& /*choices*/) {
    return looking(situation, open(situation));
}

Deed lookAgain(Situation& situation, Choices& /*choices*/) {
    auto backend = open(situation);
    contentOf(*backend);
    return looking(situation, std::move(backend));
}

Deed lookAfterOthers(Situation& situation, Choices& choices) {
    auto backend = open(situation);
    contentOf(*backend);
    letAnotherWrite(situation, choices.options(), choices);
    return looking(situation, std::move(backend));
}

Deed checkForFaults(Situation& situation, Choices& choices) {
    return {openPerhapsRead(situation, choices), [](Deed& deed) { deed.backend->check(); },
            situation.content};
}

std::vector<Story> everywhere() {
    auto stories = withStore;
    stories.insert(stories.end(), withoutStore.begin(), withoutStore.end());
    stories.insert(stories.end(), {Story::Damaged, Story::Conflict});
    return stories;
}

} // namespace

std::vector<KindOfDeed> const& kindsOfDeeds() {
    static std::vector<KindOfDeed> const kinds{
        {"append", {Story::LongBody}, true, appendABatch},
        {"commit", withStore, true, commitABatch},
        {"create", withoutStore, true, commitABatch},
        {"commit after others", withStore, true, commitAfterOthers},
        {"commit again", withStore, true, commitAgain},
        {"commit while locked", withStore, false, commitWhileLocked},
        {"discard", withStore, false, discardABatch},
        {"discard creation", {Story::NoStore}, false, discardABatch},
        {"discard in a folder", {Story::EmptyFolder, Story::HalfMadeStore}, false, discardABatch},
        {"tidy", withStore, false, tidyUp},
        {"close", withTail, false, closeWithATail},
        {"repair", {Story::Damaged}, true, repairDamage},
        {"settle", {Story::Conflict}, true, settleAConflict},
        {"first look", everywhere(), false, lookForTheFirstTime},
        {"look again", everywhere(), false, lookAgain},
        {"look after others", withStore, false, lookAfterOthers},
        {"check", everywhere(), false, checkForFaults},
    };
    return kinds;
}

std::vector<KindOfDeed> recoveriesOf(Story story) {
    KindOfDeed const look{"first look", {}, false, lookForTheFirstTime};
    switch (story) {
    case Story::Damaged:
        return {{"repair", {}, true, repairDamage}, look};
    case Story::Conflict:
        return {look}; // it is settled already, or whoever died has to settle it
    default:
        return {{"commit", {}, true, commitABatch},
                {"commit", {}, true, commitABatch},
                {"discard", {}, false, discardABatch},
                {"tidy", {}, false, tidyUp},
                look};
    }
}

} // namespace project::test

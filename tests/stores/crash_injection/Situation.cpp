#include "Situation.hpp"

#include <algorithm>
#include <iterator>

namespace project::test {

namespace {

using std::chrono::milliseconds;

TextBackend::Options rewriting() {
    return {.patience = milliseconds(20), .alwaysRewritten = 1'000'000, .bodyToTail = 16};
}

TextBackend::Options appending() {
    return {.patience = milliseconds(20), .alwaysRewritten = 0, .bodyToTail = 1};
}

/// So that some writes share a tick of the clock and some do not.
void passTime(CrashingVolume& volume, Choices& choices) {
    constexpr std::int64_t times[] = {0, 3'000'000, 100'000'000};
    volume.advance(times[choices.upTo(2)]);
}

void makeStore(Situation& situation, std::size_t files, Choices& choices) {
    auto const batch = addFiles(manyFiles(files));
    auto backend = open(situation, rewriting());
    commit(*backend, batch);
    situation.content = applied(situation.content, batch);
    backend.reset();
    for (auto turn = choices.upTo(2); turn > 0; --turn) {
        letAnotherWrite(situation, rewriting(), choices);
    }
}

/// Replaces the text, like git.
void replaceText(Situation& situation, std::string bytes) {
    situation.volume->replaceFile("project.jsonl", bytes);
    situation.content = stores::samples::contentOf(stores::samples::readWhole(std::move(bytes)));
}

std::string afterFirstLine(std::string text, std::string const& inserted) {
    return text.insert(text.find('\n') + 1, inserted);
}

void joinTwoBatches(Situation& situation, Choices& choices) {
    auto bytes = situation.volume->content("project.jsonl");
    auto const text = stores::samples::readWhole(bytes);
    auto const ours = text.tailFor(choices.batch(situation.content));
    auto const theirs = text.tailFor(choices.batch(situation.content));
    replaceText(situation, bytes + ours + theirs);
}

void bringConflict(Situation& situation) {
    auto const body = situation.volume->content("project.jsonl");
    situation.resolved = afterFirstLine(body, "\"both\"\n");
    replaceText(situation,
                afterFirstLine(body, "<<<<<<< ours\n\"our\"\n=======\n\"their\"\n>>>>>>> theirs\n"));
}

/// A writer dies at some call, and the power may be cut then.
void letAWriterDie(Situation& situation, Choices& choices) {
    auto& volume = *situation.volume;
    auto backend = open(situation, choices.oneIn(2) ? appending() : rewriting());
    auto const batch = choices.batch(situation.content);
    auto const after = applied(situation.content, batch);
    volume.plan(CrashingVolume::InjectedFault::Dies, choices.upTo(20));
    try {
        commit(*backend, batch);
    } catch (ProcessDied const&) {
        // it may have died, or may have finished
    }
    bool const isKept = volume.cancelPlan();
    abandon(volume, backend);
    if (isKept) {
        situation.content = after;
        situation.notDurable.clear();
        return;
    }
    bool const cutsPower = choices.oneIn(3);
    if (cutsPower) {
        volume.powerCut();
        situation.hadPowerCut = true;
    }
    auto const found = contentOf(*open(situation));
    auto possible = situation.notDurable;
    possible.insert(possible.end(), {situation.content, after});
    EXPECT_THAT(possible, testing::Contains(found)) << "in the history that led to a situation";
    std::erase(possible, found);
    situation.content = found;
    situation.notDurable = cutsPower ? std::vector<Content>() : possible;
}

void goOn(Situation& situation, Choices& choices) {
    auto& volume = *situation.volume;
    switch (situation.history) {
    case History::LongBody:
        situation.options = appending();
        break;
    case History::LongBodyWithTail:
        situation.options = appending();
        letAnotherWrite(situation, appending(), choices);
        break;
    case History::TornTail:
        volume.append("project.jsonl", "\"torn\"\n{\"bat");
        break;
    case History::Irregular:
        replaceText(situation, afterFirstLine(volume.content("project.jsonl"), "\n"));
        break;
    case History::MergeJoined:
        joinTwoBatches(situation, choices);
        break;
    case History::Damaged:
        replaceText(situation, afterFirstLine(volume.content("project.jsonl"), damagedLine));
        break;
    case History::Conflict:
        bringConflict(situation);
        break;
    case History::DeadWriters:
        for (auto count = choices.upTo(2) + 1; count > 0; --count) {
            letAWriterDie(situation, choices);
        }
        break;
    default:
        break;
    }
}

bool existsIn(Content const& content, Address const& address) {
    return std::any_of(content.begin(), content.end(),
                       [&address](auto const& entry) { return entry.first.isWithin(address); });
}

std::u16string toText(std::size_t number) {
    auto const digits = std::to_string(number);
    return {digits.begin(), digits.end()};
}

} // namespace

char const* const damagedLine = "\"a name without its end\n";

char const* toString(History history) {
    constexpr char const* names[] = {"NoStore",     "EmptyFolder",      "HalfMadeStore", "ShortBody",
                                     "LongBody",    "LongBodyWithTail", "TornTail",      "Irregular",
                                     "MergeJoined", "DeadWriters",      "Damaged",       "Conflict"};
    return names[static_cast<int>(history)];
}

Content applied(Content content, Batch const& batch) {
    for (auto const& change : batch) {
        switch (change.kind) {
        case stores::Change::Kind::Set:
            content[change.address] = stores::samples::described(change.node);
            break;
        case stores::Change::Kind::Remove:
            std::erase_if(content, [&](auto const& entry) { return entry.first.isWithin(change.address); });
            break;
        case stores::Change::Kind::Create:
            content[change.address] = "created";
            break;
        }
    }
    return content;
}

std::size_t Choices::upTo(std::size_t bound) {
    return std::uniform_int_distribution<std::size_t>(0, bound)(random_);
}

stores::Change Choices::change(Content const& content) {
    auto const number = toText(++count_);
    auto const some = content.empty()
                          ? content.end()
                          : std::next(content.begin(), static_cast<std::ptrdiff_t>(upTo(content.size() - 1)));
    switch (upTo(5)) {
    case 0:
        if (some != content.end()) {
            return remove(some->first);
        }
        break;
    case 1:
        if (some != content.end()) {
            return set(some->first, makeNode(u"Info", {{u"Number", number}}));
        }
        break;
    case 2:
        return make(addressOf({u"Made", number.c_str()}));
    case 3:
        if (auto const folder = fileAddress(u"folder" + toText(upTo(3))); existsIn(content, folder)) {
            return remove(folder);
        }
        break;
    default:
        break;
    }
    return set(fileAddress(u"folder" + toText(upTo(3)) + u"/file" + number));
}

Batch Choices::batch(Content const& content) {
    Batch batch;
    auto after = content;
    for (auto count = upTo(3) + 1; count > 0; --count) {
        batch.push_back(change(after));
        after = applied(std::move(after), {batch.back()});
    }
    return batch;
}

TextBackend::Options Choices::options() {
    constexpr std::size_t alwaysRewritten[] = {0, 0, 400, 1'000'000};
    constexpr std::size_t bodyToTail[] = {1, 2, 16};
    return {.patience = milliseconds(20),
            .alwaysRewritten = alwaysRewritten[upTo(3)],
            .bodyToTail = bodyToTail[upTo(2)]};
}

Situation projectWith(History history, Choices& choices, bool canExchange, bool keepsStamps) {
    Situation situation{history, std::make_shared<CrashingVolume>(choices.seed()), choices.options(), {}, {}};
    auto& volume = *situation.volume;
    volume.canExchange = canExchange;
    volume.keepsStamps = keepsStamps;
    if (history == History::HalfMadeStore) {
        letAWriterDie(situation, choices);
    } else if (history == History::EmptyFolder) {
        volume.makeFolder();
        if (choices.oneIn(2)) {
            volume.replaceFile(".gitattributes", "* text\n");
        }
    } else if (history != History::NoStore) {
        bool const isLong =
            history == History::LongBody || history == History::LongBodyWithTail || choices.oneIn(2);
        makeStore(situation, isLong ? 30 : 3, choices);
        goOn(situation, choices);
    }
    passTime(volume, choices);
    return situation;
}

std::unique_ptr<TextBackend> open(Situation const& situation, TextBackend::Options options) {
    return std::make_unique<TextBackend>(std::make_unique<CrashingDisk>(situation.volume), options);
}

std::unique_ptr<TextBackend> open(Situation const& situation) {
    return open(situation, situation.options);
}

void abandon(CrashingVolume& volume, std::unique_ptr<TextBackend>& backend) {
    volume.plan(CrashingVolume::InjectedFault::DiesBefore, 0);
    backend.reset();
    volume.cancelPlan();
}

void letAnotherWrite(Situation& situation, TextBackend::Options options, Choices& choices) {
    auto backend = open(situation, options);
    auto const batch = choices.batch(situation.content);
    commit(*backend, batch);
    situation.content = applied(situation.content, batch);
    situation.notDurable.clear();
    if (situation.history == History::LongBodyWithTail || choices.oneIn(2)) {
        abandon(*situation.volume, backend);
    }
    passTime(*situation.volume, choices);
}

} // namespace project::test

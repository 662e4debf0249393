#pragma once

#include <algorithm>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "support/TextStore.hpp"

namespace project::test {

/// How a project came to be as it is.
enum class Story {
    NoStore,
    EmptyFolder,
    HalfMadeStore, ///< whoever made it died
    ShortBody,
    LongBody,
    LongBodyWithTail,
    TornTail,
    Irregular,
    MergeJoined, ///< git has put two batches behind one text
    DeadWriters, ///< with what they left behind
    Damaged,
    Conflict, ///< with the markers of a merge
};

char const* toString(Story story);

/// A project at the moment before something is done with it.
struct Situation {
    Story story;
    std::shared_ptr<CrashingVolume> volume;
    TextBackend::Options options; ///< of whoever does it

    Content content;                 ///< what everybody reads
    std::vector<Content> notDurable; ///< what a power cut may bring back instead
    bool hadPowerCut = false;
    std::string settled{}; ///< of Conflict: the text that takes the place
};

/// What a batch makes of a content, as plainly as it can be said.
Content applied(Content content, Batch const& batch);

/// Random choices, among them random batches.
class Choices {
public:
    explicit Choices(std::uint64_t seed) : random_(seed) {}

    /// A number up to and including the bound.
    std::size_t upTo(std::size_t bound);

    bool oneIn(std::size_t count) { return upTo(count - 1) == 0; }

    /// What is new differs from what another one has made by now, too.
    void goOnAfter(Choices const& other) { count_ = std::max(count_, other.count_); }

    unsigned seed() { return static_cast<unsigned>(random_()); }

    /// Some files and other addresses added, changed and removed: real changes of this content.
    Batch batch(Content const& content);

    /// On both sides of each limit: texts here have some hundred to some thousand bytes.
    TextBackend::Options options();

private:
    stores::Change change(Content const& content);

    std::mt19937_64 random_;
    std::size_t count_ = 0; ///< so that what is new differs from all before
};

/// A project with a random history of this kind.
Situation tell(Story story, Choices& choices, bool canExchange, bool keepsStamps);

std::unique_ptr<TextBackend> open(Situation const& situation, TextBackend::Options options);
std::unique_ptr<TextBackend> open(Situation const& situation);

/// A process ends without coming to close its project.
void abandon(CrashingVolume& volume, std::unique_ptr<TextBackend>& backend);

/// Another process writes a random batch and is gone, with or without closing the project.
void letAnotherWrite(Situation& situation, TextBackend::Options options, Choices& choices);

/// A line in the text of Story::Damaged that says nothing, and must not get lost.
extern char const* const damagedLine;

} // namespace project::test

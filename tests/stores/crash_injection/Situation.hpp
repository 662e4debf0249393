#pragma once

#include <algorithm>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "support/TextStore.hpp"

namespace project::test {

/// The operations on a project before the one under test.
enum class History {
    NoStore,
    EmptyFolder,
    HalfMadeStore, ///< its creator died
    ShortBody,
    LongBody,
    LongBodyWithTail,
    TornTail,
    Irregular,
    MergeJoined, ///< git has merged two batches into one tail
    DeadWriters, ///< with their leftovers
    Damaged,
    Conflict, ///< with conflict markers
};

char const* toString(History history);

/// A project at the moment before an operation.
struct Situation {
    History history;
    std::shared_ptr<CrashingVolume> volume;
    TextBackend::Options options; ///< of the process that runs the operation

    Content content;                 ///< the content that every process reads
    std::vector<Content> notDurable; ///< contents that a power cut may restore
    bool hadPowerCut = false;
    std::string resolved{}; ///< of Conflict: the text that resolves it
};

/// The content after a batch, in the simplest form.
Content applied(Content content, Batch const& batch);

/// Random choices, among them random batches.
class Choices {
public:
    explicit Choices(std::uint64_t seed) : random_(seed) {}

    /// A number up to and including the bound.
    std::size_t upTo(std::size_t bound);

    bool oneIn(std::size_t count) { return upTo(count - 1) == 0; }

    /// New names and values also differ from those of another object.
    void goOnAfter(Choices const& other) { count_ = std::max(count_, other.count_); }

    unsigned seed() { return static_cast<unsigned>(random_()); }

    /// Adds, changes and removes some files and other addresses: real changes of this content.
    Batch batch(Content const& content);

    /// On both sides of each limit: texts here have some hundreds to some thousands of bytes.
    TextBackend::Options options();

private:
    stores::Change change(Content const& content);

    std::mt19937_64 random_;
    std::size_t count_ = 0; ///< makes new names and values unique
};

/// A project with a random history of this kind.
Situation projectWith(History history, Choices& choices, bool canExchange, bool keepsStamps);

std::unique_ptr<TextBackend> open(Situation const& situation, TextBackend::Options options);
std::unique_ptr<TextBackend> open(Situation const& situation);

/// A process ends without closing its project.
void abandon(CrashingVolume& volume, std::unique_ptr<TextBackend>& backend);

/// Another process writes a random batch and ends, with or without closing the project.
void letAnotherWrite(Situation& situation, TextBackend::Options options, Choices& choices);

/// The unreadable line in the text of History::Damaged, which must not be lost.
extern char const* const damagedLine;

} // namespace project::test

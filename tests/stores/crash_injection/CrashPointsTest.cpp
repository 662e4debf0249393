#include <algorithm>
#include <iostream>

#include "CrashPointCounts.hpp"
#include "Deeds.hpp"
#include "support/NightlyScale.hpp"

using testing::Contains;
using testing::IsEmpty;

namespace project::test {

namespace {

enum class Outcome { Done, Failed, NobodyCanTell, Died };

/// What a project may hold after a deed, as long as the power stays on.
std::vector<Content> possibleAfter(Outcome outcome, Situation const& before, Deed const& deed) {
    switch (outcome) {
    case Outcome::Done:
        return {deed.after};
    case Outcome::Failed:
        return {before.content};
    default:
        return {before.content, deed.after};
    }
}

/// Brings each trouble to each call of an operation, and looks what it leaves.
class CrashPoints {
public:
    /// @param isLarge whether there is time for trouble in each recovery, and not in some of them only.
    CrashPoints(std::uint64_t seed, bool isLarge) : choices_(seed), isLarge_(isLarge) {}

    Choices& choices() { return choices_; }

    CrashPointCounts const& counts() const { return counts_; }

    /// All calls of one kind of deed, with all kinds of trouble.
    void visit(KindOfDeed const& kind, Situation const& start) {
        for (auto const& trouble : kindsOfTrouble()) {
            auto const same = choices_; // the same deed each time, so that no call of it is left out
            for (std::size_t call = 0; visitCall(start, kind, same, trouble, call, false); ++call) {
                if (testing::Test::HasFailure()) {
                    return;
                }
            }
        }
    }

private:
    bool visitCall(Situation const& start, KindOfDeed const& kind, Choices ofDeed,
                   KindOfTrouble const& trouble, std::size_t call, bool isInRecovery);
    Outcome perform(Deed& deed, CrashingVolume& volume, KindOfTrouble const& trouble, std::size_t call);
    void checkContent(Situation& now, Deed& deed, Outcome outcome, bool makesDurable, bool cutsPower);
    void checkSameProcess(Situation& now, Deed& deed, Outcome outcome);
    void recover(Situation const& dead);
    void checkNextWriter(Situation& now);
    void bringInOrder(Situation& now);
    void checkNames(Situation const& now);

    Choices choices_;
    bool const isLarge_;
    CrashPointCounts counts_;
};

Outcome CrashPoints::perform(Deed& deed, CrashingVolume& volume, KindOfTrouble const& trouble,
                             std::size_t call) {
    volume.plan(trouble.trouble, call);
    auto outcome = Outcome::Done;
    try {
        deed.perform(deed);
        EXPECT_FALSE(deed.isRefused);
    } catch (StoreError const& error) {
        outcome = error.kind() == StoreError::Kind::OutcomeUnknown ? Outcome::NobodyCanTell : Outcome::Failed;
        EXPECT_TRUE(deed.isRefused || !volume.troubled().empty()) << error.what();
    } catch (ProcessDied const&) {
        // told by the trouble, since what must not throw keeps it to itself
    }
    volume.cancelPlan();
    deed.other.reset();
    return trouble.kills() && !volume.troubled().empty() ? Outcome::Died : outcome;
}

/// @return false when the deed makes fewer calls.
bool CrashPoints::visitCall(Situation const& start, KindOfDeed const& kind, Choices ofDeed,
                            KindOfTrouble const& trouble, std::size_t call, bool isInRecovery) {
    auto now = start;
    now.volume = start.volume->copy(choices_.seed());
    auto deed = kind.make(now, ofDeed);
    choices_.goOnAfter(ofDeed);
    auto const outcome = perform(deed, *now.volume, trouble, call);
    auto const troubled = now.volume->troubled();
    SCOPED_TRACE(std::string(kind.name) + " in " + toString(start.story) + ": " + trouble.name + " at call " +
                 std::to_string(call) + ", \"" + troubled + "\"" + (isInRecovery ? " of a recovery" : ""));

    // A disk that fails for good, so that nothing is known of what it holds, has to be mounted anew.
    bool const cutsPower = trouble.cutsPower || (outcome == Outcome::NobodyCanTell &&
                                                 trouble.trouble == CrashingVolume::Trouble::FailsForGood);
    checkContent(now, deed, outcome, kind.makesDurable, cutsPower);
    if (outcome == Outcome::Died && !isInRecovery) {
        recover(now);
    }
    if (!cutsPower && outcome != Outcome::Died && deed.backend) {
        checkSameProcess(now, deed, outcome);
    }
    deed.backend.reset();
    checkNextWriter(now);
    if (!troubled.empty()) {
        counts_.add(trouble, troubled, isInRecovery);
    } else if (trouble.cutsPower && !isInRecovery) {
        counts_.addQuietPowerCut();
    }
    return !troubled.empty();
}

/// A process that comes afterwards reads the state before the deed or the state after it.
void CrashPoints::checkContent(Situation& now, Deed& deed, Outcome outcome, bool makesDurable,
                               bool cutsPower) {
    auto possible = possibleAfter(outcome, now, deed);
    if (outcome != Outcome::Done || !makesDurable) {
        now.notDurable.insert(now.notDurable.end(), possible.begin(), possible.end());
    } else {
        now.notDurable.clear();
    }
    if (cutsPower) {
        abandon(*now.volume, deed.backend);
        now.volume->powerCut();
        now.hadPowerCut = true;
        possible.insert(possible.end(), now.notDurable.begin(), now.notDurable.end());
        now.notDurable.clear();
    } else if (outcome == Outcome::Done && deed.seen) {
        EXPECT_EQ(now.content, *deed.seen);
    }
    now.content = contentOf(*open(now));
    EXPECT_THAT(possible, Contains(now.content));
    std::erase(now.notDurable, now.content);
}

/// The process that had the trouble goes on with the same object.
void CrashPoints::checkSameProcess(Situation& now, Deed& deed, Outcome outcome) {
    EXPECT_EQ(now.content, contentOf(*deed.backend)) << "as the process sees it that had the trouble";
    bool const isWritable = now.story != Story::Damaged && now.story != Story::Conflict;
    if (!isWritable || choices_.oneIn(2)) {
        return;
    }
    auto const batch = choices_.batch(now.content);
    if (outcome == Outcome::NobodyCanTell) {
        EXPECT_THROW(commit(*deed.backend, batch), StoreError);
        return;
    }
    commit(*deed.backend, batch);
    now.content = applied(now.content, batch);
    now.notDurable.clear();
    EXPECT_EQ(now.content, contentOf(*deed.backend));
    EXPECT_EQ(now.content, contentOf(*open(now)));
}

/// Trouble comes to those that come after somebody died, too.
void CrashPoints::recover(Situation const& dead) {
    auto const kinds = recoveriesOf(dead.story);
    for (std::size_t left = isLarge_ ? 3 : choices_.oneIn(4) ? 1 : 0; left > 0; --left) {
        auto const& kind = kinds[choices_.upTo(kinds.size() - 1)];
        auto const& trouble = kindsOfTrouble()[choices_.upTo(kindsOfTrouble().size() - 1)];
        auto call = choices_.upTo(24);
        while (!visitCall(dead, kind, choices_, trouble, call, true) && call > 0) {
            call = choices_.upTo(call - 1);
        }
    }
}

/// Whoever writes next finds everything as it should be, and what it keeps stands.
void CrashPoints::checkNextWriter(Situation& now) {
    bringInOrder(now);
    auto const batch = choices_.batch(now.content);
    auto writer = open(now, choices_.options());
    commit(*writer, batch);
    auto const after = applied(now.content, batch);
    EXPECT_EQ(after, contentOf(*open(now)));
    checkNames(now);
    abandon(*now.volume, writer);
    now.volume->powerCut();
    EXPECT_EQ(after, contentOf(*open(now))) << "after the next writer's batch was kept and the power cut";
}

/// Settles what keeps everybody from writing.
void CrashPoints::bringInOrder(Situation& now) {
    auto const backend = open(now);
    auto const holdsDamagedLine = [&now](std::string const& name) {
        return now.volume->content(name).find(damagedLine) != std::string::npos;
    };
    if (now.story == Story::Damaged) {
        auto const names = now.volume->names();
        EXPECT_TRUE(std::any_of(names.begin(), names.end(), holdsDamagedLine));
        backend->repair();
    }
    if (now.story == Story::Conflict) {
        auto const faults = backend->check();
        if (!faults.empty()) {
            backend->resolve(now.settled);
        }
        now.content = stores::samples::contentOf(stores::samples::readWhole(now.settled));
    }
}

void CrashPoints::checkNames(Situation const& now) {
    for (auto const& name : now.volume->names()) {
        bool const isOfAPowerCut = now.hadPowerCut && name.starts_with("displaced-");
        bool const isOfARepair = now.story == Story::Damaged && name.starts_with("damaged-");
        EXPECT_TRUE(isOfAPowerCut || isOfARepair || name == ".gitattributes" || name == ".gitignore" ||
                    name == "project.jsonl")
            << name << " was left in the folder";
    }
}

TEST(CrashPointsOfTheStore, atEveryCallEveryTroubleLeavesTheStateBeforeOrTheStateAfter) {
    auto const seed = testSeed();
    SCOPED_TRACE("to repeat it: PROJECT_TEST_SEED=" + std::to_string(seed));
    auto const wanted = numberFromEnvironment("PROJECT_TEST_CRASH_POINTS", 0);
    CrashPoints points(seed, wanted > 0);
    std::size_t turn = seed;
    do {
        for (auto const& kind : kindsOfDeeds()) {
            auto const story = kind.stories[turn / 4 % kind.stories.size()];
            points.visit(kind, tell(story, points.choices(), turn % 2 == 0, turn / 2 % 2 == 0));
            if (HasFailure()) {
                return;
            }
            ++turn;
        }
    } while (points.counts().total() < wanted);
    EXPECT_THAT(points.counts().missing(), IsEmpty());
    if (wanted > 0) {
        points.counts().print(std::cout);
    }
}

} // namespace

} // namespace project::test

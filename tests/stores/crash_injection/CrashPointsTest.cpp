#include <algorithm>
#include <iostream>

#include "CrashPointCounts.hpp"
#include "Operations.hpp"
#include "support/NightlyScale.hpp"

using testing::Contains;
using testing::IsEmpty;

namespace project::test {

namespace {

enum class Outcome { Done, Failed, NobodyCanTell, Died };

/// The possible contents of a project after an operation without a power cut.
std::vector<Content> possibleAfter(Outcome outcome, Situation const& before,
                                   StoreOperation const& operation) {
    switch (outcome) {
    case Outcome::Done:
        return {operation.after};
    case Outcome::Failed:
        return {before.content};
    default:
        return {before.content, operation.after};
    }
}

/// Injects each fault into each call of an operation, and checks the result.
class CrashPoints {
public:
    /// @param isLarge whether to inject faults into each recovery, not only into some.
    CrashPoints(std::uint64_t seed, bool isLarge) : choices_(seed), isLarge_(isLarge) {}

    Choices& choices() { return choices_; }

    CrashPointCounts const& counts() const { return counts_; }

    /// All calls of one kind of operation, with all kinds of faults.
    void visit(OperationKind const& kind, Situation const& start) {
        for (auto const& fault : faultKinds()) {
            auto const same = choices_; // the same operation each time, so that every call is reached
            for (std::size_t call = 0; visitCall(start, kind, same, fault, call, false); ++call) {
                if (testing::Test::HasFailure()) {
                    return;
                }
            }
        }
    }

private:
    bool visitCall(Situation const& start, OperationKind const& kind, Choices ofOperation,
                   FaultKind const& fault, std::size_t call, bool isInRecovery);
    Outcome perform(StoreOperation& operation, CrashingVolume& volume, FaultKind const& fault,
                    std::size_t call);
    void checkContent(Situation& now, StoreOperation& operation, Outcome outcome, bool makesDurable,
                      bool cutsPower);
    void checkSameProcess(Situation& now, StoreOperation& operation, Outcome outcome);
    void recover(Situation const& dead);
    void checkNextWriter(Situation& now);
    void bringInOrder(Situation& now);
    void checkNames(Situation const& now);

    Choices choices_;
    bool const isLarge_;
    CrashPointCounts counts_;
};

Outcome CrashPoints::perform(StoreOperation& operation, CrashingVolume& volume, FaultKind const& fault,
                             std::size_t call) {
    volume.plan(fault.fault, call);
    auto outcome = Outcome::Done;
    try {
        operation.perform(operation);
        EXPECT_FALSE(operation.isRefused);
    } catch (StoreError const& error) {
        outcome = error.kind() == StoreError::Kind::OutcomeUnknown ? Outcome::NobodyCanTell : Outcome::Failed;
        EXPECT_TRUE(operation.isRefused || !volume.faulted().empty()) << error.what();
    } catch (ProcessDied const&) {
        // recorded by the fault, since functions that must not throw hide it
    }
    volume.cancelPlan();
    operation.other.reset();
    return fault.kills() && !volume.faulted().empty() ? Outcome::Died : outcome;
}

/// @return false if the operation makes fewer calls.
bool CrashPoints::visitCall(Situation const& start, OperationKind const& kind, Choices ofOperation,
                            FaultKind const& fault, std::size_t call, bool isInRecovery) {
    auto now = start;
    now.volume = start.volume->copy(choices_.seed());
    auto operation = kind.make(now, ofOperation);
    choices_.goOnAfter(ofOperation);
    auto const outcome = perform(operation, *now.volume, fault, call);
    auto const faulted = now.volume->faulted();
    SCOPED_TRACE(std::string(kind.name) + " in " + toString(start.history) + ": " + fault.name + " at call " +
                 std::to_string(call) + ", \"" + faulted + "\"" + (isInRecovery ? " of a recovery" : ""));

    // After a permanent fault the content of the disk is unknown: it is mounted again.
    bool const cutsPower = fault.cutsPower || (outcome == Outcome::NobodyCanTell &&
                                               fault.fault == CrashingVolume::InjectedFault::FailsForGood);
    checkContent(now, operation, outcome, kind.makesDurable, cutsPower);
    if (outcome == Outcome::Died && !isInRecovery) {
        recover(now);
    }
    if (!cutsPower && outcome != Outcome::Died && operation.backend) {
        checkSameProcess(now, operation, outcome);
    }
    operation.backend.reset();
    checkNextWriter(now);
    if (!faulted.empty()) {
        counts_.add(fault, faulted, isInRecovery);
    } else if (fault.cutsPower && !isInRecovery) {
        counts_.addQuietPowerCut();
    }
    return !faulted.empty();
}

/// A later process reads the state before the operation or the state after it.
void CrashPoints::checkContent(Situation& now, StoreOperation& operation, Outcome outcome, bool makesDurable,
                               bool cutsPower) {
    auto possible = possibleAfter(outcome, now, operation);
    if (outcome != Outcome::Done || !makesDurable) {
        now.notDurable.insert(now.notDurable.end(), possible.begin(), possible.end());
    } else {
        now.notDurable.clear();
    }
    if (cutsPower) {
        abandon(*now.volume, operation.backend);
        now.volume->powerCut();
        now.hadPowerCut = true;
        possible.insert(possible.end(), now.notDurable.begin(), now.notDurable.end());
        now.notDurable.clear();
    } else if (outcome == Outcome::Done && operation.seen) {
        EXPECT_EQ(now.content, *operation.seen);
    }
    now.content = contentOf(*open(now));
    EXPECT_THAT(possible, Contains(now.content));
    std::erase(now.notDurable, now.content);
}

/// The process with the fault continues with the same object.
void CrashPoints::checkSameProcess(Situation& now, StoreOperation& operation, Outcome outcome) {
    EXPECT_EQ(now.content, contentOf(*operation.backend)) << "as seen by the process with the fault";
    bool const isWritable = now.history != History::Damaged && now.history != History::Conflict;
    if (!isWritable || choices_.oneIn(2)) {
        return;
    }
    auto const batch = choices_.batch(now.content);
    if (outcome == Outcome::NobodyCanTell) {
        EXPECT_THROW(commit(*operation.backend, batch), StoreError);
        return;
    }
    commit(*operation.backend, batch);
    now.content = applied(now.content, batch);
    now.notDurable.clear();
    EXPECT_EQ(now.content, contentOf(*operation.backend));
    EXPECT_EQ(now.content, contentOf(*open(now)));
}

/// Faults are injected into the recovery, too.
void CrashPoints::recover(Situation const& dead) {
    auto const kinds = recoveriesOf(dead.history);
    for (std::size_t left = isLarge_ ? 3 : choices_.oneIn(4) ? 1 : 0; left > 0; --left) {
        auto const& kind = kinds[choices_.upTo(kinds.size() - 1)];
        auto const& fault = faultKinds()[choices_.upTo(faultKinds().size() - 1)];
        auto call = choices_.upTo(24);
        while (!visitCall(dead, kind, choices_, fault, call, true) && call > 0) {
            call = choices_.upTo(call - 1);
        }
    }
}

/// The next writer finds a sound project, and its batch is committed.
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
    EXPECT_EQ(after, contentOf(*open(now)))
        << "after the next writer's batch was committed and the power cut";
}

/// Repairs or resolves the text if the store refuses writes because of it.
void CrashPoints::bringInOrder(Situation& now) {
    auto const backend = open(now);
    auto const holdsDamagedLine = [&now](std::string const& name) {
        return now.volume->content(name).find(damagedLine) != std::string::npos;
    };
    if (now.history == History::Damaged) {
        auto const names = now.volume->names();
        EXPECT_TRUE(std::any_of(names.begin(), names.end(), holdsDamagedLine));
        backend->repair();
    }
    if (now.history == History::Conflict) {
        auto const faults = backend->check();
        if (!faults.empty()) {
            backend->resolve(now.resolved);
        }
        now.content = stores::samples::contentOf(stores::samples::readWhole(now.resolved));
    }
}

void CrashPoints::checkNames(Situation const& now) {
    for (auto const& name : now.volume->names()) {
        bool const isOfAPowerCut = now.hadPowerCut && name.starts_with("displaced-");
        bool const isOfARepair = now.history == History::Damaged && name.starts_with("damaged-");
        EXPECT_TRUE(isOfAPowerCut || isOfARepair || name == ".gitattributes" || name == ".gitignore" ||
                    name == "project.jsonl")
            << name << " was left in the folder";
    }
}

TEST(CrashPointsOfTheStore, everyFaultAtEveryCallLeavesTheStateBeforeOrTheStateAfter) {
    auto const seed = testSeed();
    SCOPED_TRACE("to repeat it: PROJECT_TEST_SEED=" + std::to_string(seed));
    auto const wanted = numberFromEnvironment("PROJECT_TEST_CRASH_POINTS", 0);
    CrashPoints points(seed, wanted > 0);
    std::size_t turn = seed;
    do {
        for (auto const& kind : operationKinds()) {
            auto const history = kind.histories[turn / 4 % kind.histories.size()];
            points.visit(kind, projectWith(history, points.choices(), turn % 2 == 0, turn / 2 % 2 == 0));
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

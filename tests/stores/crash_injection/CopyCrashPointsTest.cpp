#include <array>
#include <functional>
#include <string>

#include "CrashPointCounts.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/StoreCopy.hpp"
#include "support/TextStore.hpp"

namespace project::test {

namespace {

enum class LeadsTo { Text, Server };

enum class Outcome { Done, Failed, Unknown, Died };

using Operation = std::function<void(stores::Disk&)>;

/// Copies of a project between a text and a server, with a fault in each call on the folder.
class CopyCrashPoints : public ::testing::Test {
protected:
    /// @param from what the folder leads to before the copy.
    void visit(LeadsTo from, Operation const& copy) {
        from_ = from;
        auto const start = folderThatLeadsTo(from);
        for (auto const& fault : faultKinds()) {
            for (std::size_t call = 0; visitCall(*start, copy, fault, call); ++call) {
                ASSERT_FALSE(HasFailure());
            }
        }
        EXPECT_GT(unfinished_, 10) << "states between the last two steps";
    }

    stores::SharedLocation const location_{"postgresql", "engine", "3f0d6f0e-8c2b-4f52-9d0e-5a3f9b7c1d2e"};
    std::string const text_ = textOf(addFiles(manyFiles(20)));

private:
    std::shared_ptr<CrashingVolume> folderThatLeadsTo(LeadsTo target) const {
        auto volume = std::make_shared<CrashingVolume>();
        volume->makeFolder();
        if (target == LeadsTo::Text) {
            volume->replaceFile("project.jsonl", text_);
        } else {
            CrashingDisk disk(volume);
            stores::createSharedLocation(disk, location_);
        }
        return volume;
    }

    /// @return false if the operation makes fewer calls.
    bool visitCall(CrashingVolume const& start, Operation const& copy, FaultKind const& fault,
                   std::size_t call) {
        bool isReached = false;
        for (unsigned seed = 1; seed <= 3; ++seed) { // a power cut loses other names each time
            auto const now = start.copy(seed);
            auto const outcome = perform(copy, *now, now, fault, call);
            isReached = !now->faulted().empty();
            SCOPED_TRACE(std::string(fault.name) + " at call " + std::to_string(call) + ", \"" +
                         now->faulted() + "\"");
            if (now->has("project.jsonl") && now->has("store.json")) {
                ++unfinished_;
                visitRecoveries(*now);
            }
            checkAfter(outcome, now, fault.cutsPower);
        }
        return isReached;
    }

    static Outcome perform(Operation const& operation, CrashingVolume& volume,
                           std::shared_ptr<CrashingVolume> const& shared, FaultKind const& fault,
                           std::size_t call) {
        auto outcome = Outcome::Done;
        volume.plan(fault.fault, call);
        try {
            CrashingDisk disk(shared);
            operation(disk);
        } catch (StoreError const& error) {
            outcome = error.kind() == StoreError::Kind::OutcomeUnknown ? Outcome::Unknown : Outcome::Failed;
            EXPECT_FALSE(volume.faulted().empty()) << error.what();
        } catch (ProcessDied const&) {
            // recorded by the fault, since functions that must not throw hide it
        }
        volume.cancelPlan();
        outcome = fault.kills() && !volume.faulted().empty() ? Outcome::Died : outcome;
        if (fault.cutsPower) {
            volume.powerCut();
        }
        return outcome;
    }

    /// The next process dies, too, or cannot finish the copy. A power cut may lose the new file, which the
    /// dead process did not make durable.
    void visitRecoveries(CrashingVolume const& dead) {
        for (auto const& fault : faultKinds()) {
            bool isReached = true;
            for (std::size_t call = 0; isReached && !HasFailure(); ++call) {
                auto const now = dead.copy(static_cast<unsigned>(call));
                perform([](stores::Disk& disk) { stores::readSharedLocation(disk); }, *now, now, fault, call);
                isReached = !now->faulted().empty();
                SCOPED_TRACE(std::string("in a recovery: ") + fault.name + " at call " +
                             std::to_string(call));
                auto const found = target(now);
                EXPECT_TRUE(fault.cutsPower || found != from_) << "the copy was not finished";
            }
        }
    }

    void checkAfter(Outcome outcome, std::shared_ptr<CrashingVolume> const& volume, bool hadPowerCut) const {
        auto const now = target(volume);
        if (outcome == Outcome::Done) {
            EXPECT_NE(now, from_);
        } else if (outcome == Outcome::Failed) {
            EXPECT_EQ(now, from_);
        }
        if (now != from_ && !hadPowerCut) { // which may lose a file between two names
            EXPECT_TRUE(volume->has(from_ == LeadsTo::Text ? "project.jsonl.old" : "store.json.old"));
        }
    }

    /// What the next process finds.
    LeadsTo target(std::shared_ptr<CrashingVolume> const& volume) const {
        CrashingDisk disk(volume);
        if (auto const found = stores::readSharedLocation(disk)) {
            EXPECT_EQ(*found, location_);
            EXPECT_FALSE(volume->has("project.jsonl"));
            return LeadsTo::Server;
        }
        EXPECT_EQ(volume->content("project.jsonl"), text_);
        return LeadsTo::Text;
    }

    LeadsTo from_ = LeadsTo::Text;
    int unfinished_ = 0;
};

TEST_F(CopyCrashPoints, aFolderWhoseCopyToAServerWasInterruptedLeadsToOneOfTheStores) {
    visit(LeadsTo::Text, [this](stores::Disk& disk) {
        disk.openFolder();
        stores::replaceTextByLocation(disk, location_);
    });
}

TEST_F(CopyCrashPoints, aFolderWhoseCopyToATextWasInterruptedLeadsToOneOfTheStores) {
    visit(LeadsTo::Server, [this](stores::Disk& disk) { stores::replaceLocationByText(disk, text_); });
}

} // namespace

} // namespace project::test

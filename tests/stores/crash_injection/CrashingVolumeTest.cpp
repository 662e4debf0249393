#include <algorithm>
#include <set>

#include "project/stores/StoreError.hpp"
#include "support/CrashingDisk.hpp"

using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsSupersetOf;
using testing::UnorderedElementsAre;

namespace project::test {

namespace {

using stores::StoreError;

/// The writes that a disk in memory loses: tests on a disk that loses nothing would prove nothing.
class CrashingVolumeForgetting : public testing::Test {
protected:
    /// All answers to the given question after every possible power cut.
    template <typename Question>
    std::set<std::string> afterPowerCuts(Question const& question) const {
        std::set<std::string> found;
        for (unsigned seed = 0; seed < 300; ++seed) {
            auto const cut = volume->copy(seed);
            cut->powerCut();
            found.insert(question(*cut));
        }
        return found;
    }

    std::set<std::string> contentsAfterPowerCuts(std::string const& name) const {
        return afterPowerCuts([&name](CrashingVolume const& cut) { return cut.content(name); });
    }

    void append(std::string const& bytes) { disk.append("a", *disk.identify("a"), bytes); }

    /// Names and the contents of their files, "a=first b=second".
    static std::string described(CrashingVolume const& cut) {
        std::string result;
        for (auto const& name : cut.names()) {
            result += (result.empty() ? "" : " ") + name + "=" + cut.content(name);
        }
        return result;
    }

    void makeDurable(std::string const& name, std::string const& bytes) {
        disk.create(name, bytes, std::nullopt);
        disk.sync();
        disk.syncFolder();
    }

    void SetUp() override { disk.makeFolder(); }

    std::shared_ptr<CrashingVolume> const volume = std::make_shared<CrashingVolume>();
    CrashingDisk disk{volume};
};

TEST_F(CrashingVolumeForgetting, syncedDataSurvivesAnyPowerCut) {
    makeDurable("a", "12");
    append("34");
    disk.sync();

    EXPECT_THAT(contentsAfterPowerCuts("a"), ElementsAre("1234"));
}

TEST_F(CrashingVolumeForgetting, anySubsetOfTheUnsyncedWritesIsKeptAndMayBeTorn) {
    makeDurable("a", "");
    append("12");
    append("34");

    auto const left = contentsAfterPowerCuts("a");

    std::string const hole(2, '\0');
    EXPECT_THAT(left, IsSupersetOf({std::string(), std::string("12"), std::string("1234"), hole + "34"}))
        << "a disk that writes in another order keeps the later write without the earlier one";
    EXPECT_THAT(left, IsSupersetOf({std::string("1"), std::string("123"), hole + "3"})) << "torn";
    EXPECT_THAT(left, IsSupersetOf({std::string("1\0", 2), hole, std::string("123\0", 4)}))
        << "the length of a write without its data";
}

TEST_F(CrashingVolumeForgetting, writesToTwoFilesAreLostIndependently) {
    makeDurable("a", "");
    makeDurable("b", "");
    append("x");
    disk.append("b", *disk.identify("b"), "y");

    EXPECT_THAT(afterPowerCuts(described), IsSupersetOf({"a= b=", "a=x b=", "a= b=y", "a=x b=y"}));
}

TEST_F(CrashingVolumeForgetting, aNewNameIsLostUntilTheFolderIsSynced) {
    disk.create("a", "x", std::nullopt);
    disk.sync();
    EXPECT_THAT(afterPowerCuts(described), UnorderedElementsAre("", "a=x"));

    disk.syncFolder();
    EXPECT_THAT(afterPowerCuts(described), ElementsAre("a=x"));
}

TEST_F(CrashingVolumeForgetting, aRemovedNameMayReappearUntilTheFolderIsSynced) {
    makeDurable("a", "x");
    disk.remove("a");
    EXPECT_THAT(afterPowerCuts(described), UnorderedElementsAre("", "a=x"));

    disk.syncFolder();
    EXPECT_THAT(afterPowerCuts(described), ElementsAre(""));
}

TEST_F(CrashingVolumeForgetting, eachNameOfARenamedFileExistsOrNotIndependently) {
    makeDurable("a", "x");
    disk.rename("a", "b");

    EXPECT_THAT(afterPowerCuts(described), UnorderedElementsAre("", "a=x", "b=x", "a=x b=x"));
}

TEST_F(CrashingVolumeForgetting, eachOfTwoExchangedNamesLeadsToEitherFile) {
    makeDurable("a", "x");
    makeDurable("b", "y");
    disk.exchange("a", "b");

    EXPECT_THAT(afterPowerCuts(described), UnorderedElementsAre("a=x b=x", "a=x b=y", "a=y b=x", "a=y b=y"));
}

TEST_F(CrashingVolumeForgetting, aNameMayLeadToAnyOfItsFilesSinceTheLastSync) {
    makeDurable("a", "1");
    makeDurable("b", "2");
    makeDurable("c", "3");
    disk.rename("b", "a");
    disk.rename("c", "a");

    EXPECT_THAT(contentsAfterPowerCuts("a"), UnorderedElementsAre("1", "2", "3"));
}

TEST_F(CrashingVolumeForgetting, dataOfAFailedSyncIsNotMadeDurableByALaterOne) {
    makeDurable("a", "");
    append("1");
    volume->plan(CrashingVolume::InjectedFault::Fails, 0);
    EXPECT_THROW(disk.sync(), StoreError);
    append("2");
    disk.sync();

    auto const left = contentsAfterPowerCuts("a");

    EXPECT_THAT(left, UnorderedElementsAre("12", std::string("\0", 1) + "2"));
}

TEST_F(CrashingVolumeForgetting, aStampIsLostUntilTheFileIsSynced) {
    auto const made = disk.create("a", "x", std::nullopt);
    disk.syncFolder();
    auto const question = [&](CrashingVolume& cut) {
        CrashingDisk after(std::shared_ptr<CrashingVolume>(&cut, [](auto*) {}));
        after.openFolder();
        return after.identify("a")->modified == made.identity.modified ? "kept" : "lost";
    };
    EXPECT_THAT(afterPowerCuts(question), UnorderedElementsAre("kept", "lost"));

    disk.sync();
    EXPECT_THAT(afterPowerCuts(question), ElementsAre("kept"));
}

TEST_F(CrashingVolumeForgetting, aFolderWhoseCreatorDiedInTheCallMayBeLostAndACreatedOneStays) {
    EXPECT_THAT(afterPowerCuts([](CrashingVolume const& cut) { return cut.hasFolder() ? "there" : "lost"; }),
                ElementsAre("there"));

    volume->removeFolder();
    volume->plan(CrashingVolume::InjectedFault::DiesAmid, 0);
    EXPECT_THROW(CrashingDisk(volume).makeFolder(), ProcessDied);

    ASSERT_TRUE(volume->hasFolder());
    EXPECT_THAT(afterPowerCuts([](CrashingVolume const& cut) { return cut.hasFolder() ? "there" : "lost"; }),
                UnorderedElementsAre("there", "lost"));
}

TEST_F(CrashingVolumeForgetting, aRemovedFolderMayReappear) {
    disk.removeFolder();

    EXPECT_FALSE(volume->hasFolder());
    EXPECT_THAT(afterPowerCuts([](CrashingVolume const& cut) { return cut.hasFolder() ? "there" : "lost"; }),
                UnorderedElementsAre("there", "lost"));
}

TEST_F(CrashingVolumeForgetting, aCopyIsIndependent) {
    makeDurable("a", "1");
    append("2");
    disk.rename("a", "b");
    auto const copy = volume->copy(7);
    CrashingDisk other(copy);
    other.openFolder();

    other.append("b", *other.identify("b"), "3");
    other.sync();
    other.syncFolder();

    EXPECT_EQ("b=12", described(*volume));
    EXPECT_EQ("b=123", described(*copy));
    copy->powerCut();
    EXPECT_EQ("b=123", described(*copy));
    EXPECT_THAT(afterPowerCuts(described), IsSupersetOf({"", "a=1", "b=1", "a=12 b=12"}))
        << "a sync of the copy makes nothing durable in the original";
}

/// The moments at which a process dies at a call.
class CrashingVolumeDying : public CrashingVolumeForgetting {
protected:
    using InjectedFault = CrashingVolume::InjectedFault;

    /// The contents of a file to which "12345678" was to be appended, over all ways to die.
    std::set<std::string> left(InjectedFault fault) const {
        std::set<std::string> found;
        for (unsigned seed = 0; seed < 100; ++seed) {
            auto const copy = volume->copy(seed);
            CrashingDisk dying(copy);
            dying.openFolder();
            auto const before = *dying.identify("a");
            copy->plan(fault, 0);
            EXPECT_THROW(dying.append("a", before, "12345678"), ProcessDied);
            EXPECT_EQ("append a", copy->faulted());
            EXPECT_THROW(dying.identify("a"), ProcessDied) << "it refuses further calls";
            found.insert(copy->content("a"));
        }
        return found;
    }

    void SetUp() override {
        CrashingVolumeForgetting::SetUp();
        makeDurable("a", "");
    }
};

TEST_F(CrashingVolumeDying, dyingBeforeAmidOrAfterACallLeavesNothingAPartOrAll) {
    EXPECT_THAT(left(InjectedFault::DiesBefore), ElementsAre(""));
    EXPECT_THAT(left(InjectedFault::DiesAfter), ElementsAre("12345678"));
    EXPECT_THAT(left(InjectedFault::DiesAmid),
                ElementsAre("", "1", "12", "123", "1234", "12345", "123456", "1234567"));
    EXPECT_THAT(left(InjectedFault::Dies), IsSupersetOf({"12345678", "1234"}));
}

TEST_F(CrashingVolumeDying, theLockIsReleasedWhenTheProcessDies) {
    disk.openFolder();
    disk.lock(std::chrono::milliseconds(1));
    volume->plan(InjectedFault::DiesBefore, 0);
    EXPECT_THROW(disk.identify("a"), ProcessDied);

    CrashingDisk next(volume);
    next.openFolder();
    EXPECT_TRUE(next.lock(std::chrono::milliseconds(1)));
}

TEST_F(CrashingVolumeDying, aFaultHitsThePlannedCallOnceOrPermanently) {
    volume->plan(InjectedFault::Fails, 1);
    disk.identify("a");
    EXPECT_EQ("", volume->faulted());
    EXPECT_THROW(disk.list(), StoreError);
    EXPECT_EQ("list", volume->faulted());
    EXPECT_THAT(disk.list(), ElementsAre("a"));

    volume->plan(InjectedFault::FailsForGood, 0);
    EXPECT_THROW(disk.list(), StoreError);
    EXPECT_THROW(disk.identify("a"), StoreError);
    volume->cancelPlan();
    EXPECT_TRUE(disk.identify("a"));
}

TEST(CrashingVolumeFolding, namesThatDifferInCaseLeadToTheSameFileWhichKeepsItsCase) {
    auto const volume = std::make_shared<CrashingVolume>();
    volume->foldsNames = true;
    volume->makeFolder();
    volume->replaceFile("A", "x");
    CrashingDisk disk(volume);
    disk.openFolder();

    EXPECT_TRUE(disk.identify("a"));
    EXPECT_THROW(disk.create("a", "y", std::nullopt), StoreError);
    disk.create("b", "y", std::nullopt);
    EXPECT_FALSE(disk.renameToFree("b", "a"));
    disk.exchange("b", "a");
    EXPECT_THAT(volume->names(), ElementsAre("A", "b"));
    EXPECT_EQ("y", volume->content("a"));
    EXPECT_TRUE(disk.remove("a"));
    EXPECT_THAT(volume->names(), ElementsAre("b"));
}

} // namespace

} // namespace project::test

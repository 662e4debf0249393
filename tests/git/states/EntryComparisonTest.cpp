#include <functional>

#include <fcntl.h>
#include <git2.h>
#include <sys/stat.h>

#include "git/GitRepository.hpp"

namespace project::git {
namespace {

/// Which differences from the index count as a change. The file has a filter driver, so that it is 1 only if
/// its content need not be compared, and 3 if it would have to be.
class EntryComparison : public GitTest {
protected:
    void SetUp() override {
        repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
        repository.write(".gitattributes", "*.up filter=upper\n");
        repository.write("a.up", "TEXT\n");
        setTime(repository.onDisk() / "a.up", modified);
        repository.commitAll();
        setTime(repository.indexFile(), {modified.tv_sec + 1, 0});
    }

    static void setTime(std::filesystem::path const& file, timespec const& time) {
        timespec const times[] = {time, time};
        ASSERT_EQ(::utimensat(AT_FDCWD, file.c_str(), times, 0), 0);
    }

    /// Writes the index with another entry for the file, and gives it an age.
    void changeEntry(std::function<void(git_index_entry&)> const& change, timespec const& age) const {
        git_index* index = nullptr;
        ASSERT_EQ(git_index_open(&index, repository.indexFile().c_str()), 0);
        auto entry = *git_index_get_bypath(index, "a.up", 0);
        change(entry);
        EXPECT_EQ(git_index_add(index, &entry), 0);
        EXPECT_EQ(git_index_write(index), 0);
        git_index_free(index);
        setTime(repository.indexFile(), age);
    }

    /// The state with a change of the entry, in an index that is younger than it.
    int stateWith(std::function<void(git_index_entry&)> const& change) {
        std::filesystem::copy_file(repository.indexFile(), folder.onDisk() / "index-before",
                                   std::filesystem::copy_options::overwrite_existing);
        changeEntry(change, {modified.tv_sec + 2, 0});
        auto const result = stateOf("a.up");
        std::filesystem::copy_file(folder.onDisk() / "index-before", repository.indexFile(),
                                   std::filesystem::copy_options::overwrite_existing);
        return result;
    }

    int stateWithIndexOf(timespec const& age) {
        setTime(repository.indexFile(), age);
        return stateOf("a.up");
    }

    timespec const modified{1'700'000'000, 123'456'789};
};

TEST_F(EntryComparison, aFileWithTheTimesAndSizeOfItsEntryIsUnmodified) {
    EXPECT_EQ(agreedStateOf("a.up"), 1);
    EXPECT_EQ(stateWith([](auto&) {}), 1);
}

TEST_F(EntryComparison, everyDifferenceOfTheRecordedValuesIsATouch) {
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.mtime.seconds; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.mtime.nanoseconds; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.ctime.seconds; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { entry.ctime.nanoseconds = entry.ctime.nanoseconds / 2 + 1; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.ino; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.uid; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.gid; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.file_size; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { entry.file_size = 0; }), 3);
    EXPECT_EQ(stateWith([](auto& entry) { ++entry.dev; }), 1) << "git does not compare devices";
}

TEST_F(EntryComparison, nanosecondsOf0AreUnknownOnes) {
    EXPECT_EQ(stateWith([](auto& entry) { entry.mtime.nanoseconds = 0; }), 1);
    EXPECT_EQ(stateWith([](auto& entry) { entry.ctime.nanoseconds = 0; }), 1);
}

TEST_F(EntryComparison, anEntryThatIsAsYoungAsItsIndexIsComparedByContent) {
    auto const [seconds, nanoseconds] = modified;
    EXPECT_EQ(stateWithIndexOf({seconds, nanoseconds + 1}), 1);
    EXPECT_EQ(stateWithIndexOf({seconds, nanoseconds}), 3);
    EXPECT_EQ(stateWithIndexOf({seconds, nanoseconds - 1}), 3);
    EXPECT_EQ(stateWithIndexOf({seconds + 1, 0}), 1);
    EXPECT_EQ(stateWithIndexOf({seconds - 1, 999'999'999}), 3);
}

TEST_F(EntryComparison, anEntryWithoutNanosecondsIsAsYoungAsAnIndexOfTheSameSecond) {
    auto const seconds = modified.tv_sec;
    changeEntry([](auto& entry) { entry.mtime.nanoseconds = 0; }, {seconds + 1, 0});
    EXPECT_EQ(stateOf("a.up"), 1);
    EXPECT_EQ(stateWithIndexOf({seconds, 999'999'999}), 3);
    EXPECT_EQ(stateWithIndexOf({seconds, 0}), 3);
}

TEST_F(EntryComparison, aFileOfAnotherSizeIsModifiedWithoutAComparison) {
    repository.write("a.up", "other text\n");
    EXPECT_EQ(agreedStateOf("a.up"), 3);
}

TEST_F(EntryComparison, aLinkThatWasOnlyCreatedAnewIsUnmodified) {
    for (std::string const target : {"a.up", "nowhere", "."}) {
        folder.addLink("work/link", target);
        repository.commitAll();
        repository.remove("link");
        folder.addLink("work/link", target);
        EXPECT_EQ(agreedStateOf("link"), 1) << target;
        repository.remove("link");
    }
}

TEST_F(EntryComparison, aLinkWithAnotherTargetOfTheSameLengthIsModified) {
    folder.addLink("work/link", "a.up");
    repository.commitAll();
    repository.remove("link");
    folder.addLink("work/link", "b.up");
    EXPECT_EQ(agreedStateOf("link"), 3);
}

} // namespace
} // namespace project::git

#include <filesystem>
#include <map>
#include <utility>

#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::UnorderedElementsAre;

/// A committed project with the files "a", "b" and "src/io/pump.cpp". "a" and "src" have the label "Open".
class DryRun : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        for (auto const* name : {u"a", u"b", u"src/io/pump.cpp"}) {
            folder_.file(name);
        }
        ASSERT_THAT(tool({"batch"}, "add a b src/io/pump.cpp\ncategory create Status --single-valued\n"
                                    "label create Status Open\nlabel create Status Done\n"
                                    "label put Status Open a src\nentry set src/io/pump.cpp\n"),
                    SucceedsSilently());
        git_.commitAll();
        folder_.file(u"src/io/new.cpp");
    }

    /// The content and the time of each file in the folder, with those of git.
    using Snapshot = std::map<std::string, std::pair<std::string, std::filesystem::file_time_type>>;

    Snapshot snapshot() const {
        Snapshot result;
        for (auto const& entry : std::filesystem::recursive_directory_iterator(folder_.onDisk())) {
            if (entry.is_regular_file()) {
                std::ifstream file(entry.path(), std::ios::binary);
                result[entry.path().string()] = {{std::istreambuf_iterator<char>(file), {}},
                                                 entry.last_write_time()};
            }
        }
        return result;
    }

    /// Expects that a command shows these changes with --dry-run, and changes no file.
    void expectShown(std::vector<std::string> command, std::string const& changes,
                     std::string const& input = {}) const {
        auto const before = snapshot();
        command.emplace_back("--dry-run");
        EXPECT_THAT(tool(command, input), Prints(changes)) << ::testing::PrintToString(command);
        EXPECT_EQ(snapshot(), before) << ::testing::PrintToString(command);
    }

    GitFolder const git_{folder_.onDisk()};
};

TEST_F(DryRun, ofAddShowsThePathsThatWouldBeNew) {
    folder_.file(u"docs/guide/index");

    expectShown({"add", "src/io/new.cpp", "a"}, "add src/io/new.cpp\n");
    expectShown({"add", "-r", "."}, "add docs\nadd docs/guide\nadd docs/guide/index\nadd src/io/new.cpp\n");
    expectShown({"add", "-0"}, "add docs\nadd docs/guide\n", withZeros({"docs/guide"}));
    expectShown({"add", "a"}, "");
}

TEST_F(DryRun, ofAddAnewShowsTheLabelsThatWouldBeLost) {
    expectShown({"add", "--anew", "a", "b", "src/io/pump.cpp"}, "take Status=Open a\n");
}

TEST_F(DryRun, ofRemoveShowsEverythingThatWouldBeRemoved) {
    expectShown({"remove", "a"}, "remove a\n");
    expectShown({"remove", "src"},
                "entry remove src/io/pump.cpp\nremove src\nremove src/io\nremove src/io/pump.cpp\n");
}

TEST_F(DryRun, ofLabelsShowsTheLabelThatWouldBeReplaced) {
    expectShown({"label", "put", "Status", "Done", "a", "b"},
                "take Status=Open a\nput Status=Done a\nput Status=Done b\n");
    expectShown({"label", "put", "Status", "Open", "a"}, "");
    expectShown({"label", "take", "Status", "Open", "src", "a", "b"},
                "take Status=Open a\ntake Status=Open src\n");
}

TEST_F(DryRun, ofABatchShowsTheDifferenceThatItWouldMake) {
    auto const before = snapshot();

    auto const result =
        tool({"batch", "--dry-run"},
             "category create Owner\nlabel create Owner Ann\ncategory rename Owner Boss\n"
             "label delete Status Open\nadd src/io/new.cpp\nlabel put Boss Ann a src/io/new.cpp\nremove b\n"
             "name 'two\nlines'\ndescription \"it's\"\ngroup create Nightly\ngroup rename Nightly Daily\n"
             "remove a\nadd a\nlabel put Boss Ann a\n"
             "entry set a\nentry remove src/io/pump.cpp\npath add src\nreference add --absolute /opt\n");

    EXPECT_EQ(result.errors, "");
    EXPECT_THAT(linesOf(result.output), // in the order of addresses, which for some are random UUIDs
                UnorderedElementsAre("label delete Status=Open", "category create Boss",
                                     "label create Boss=Ann", "group create Daily", "entry set a",
                                     "entry remove src/io/pump.cpp", "take Status=Open a", "put Boss=Ann a",
                                     "remove b", "take Status=Open src", "add src/io/new.cpp",
                                     "put Boss=Ann src/io/new.cpp", "name \"two\\nlines\"", "path add src",
                                     "reference add /opt", "description it's"));
    EXPECT_EQ(snapshot(), before);
}

TEST_F(DryRun, ofABatchShowsTheLabelsOfADeletedCategory) {
    EXPECT_THAT(linesOf(tool({"batch", "--dry-run"}, "category delete Status\n").output),
                UnorderedElementsAre("category delete Status", "label delete Status=Done",
                                     "label delete Status=Open", "take Status=Open a",
                                     "take Status=Open src"));
}

TEST_F(DryRun, ofABatchShowsNothingForChangesThatCancelEachOther) {
    expectShown({"batch"}, "category rename Status=State\n",
                "category rename Status S\ncategory rename S State\n");
    expectShown({"batch"}, "",
                "remove a\nadd a\nlabel put Status Open a\nadd src/io/new.cpp\nremove src/io/new.cpp\n");
}

TEST_F(DryRun, ofABatchShowsTheOutputOfItsCommandsFirst) {
    expectShown({"batch"}, "b\nsrc\nsrc/io\nsrc/io/pump.cpp\nremove a\nremove b\n",
                "remove a\nlist\nremove b\n");
}

TEST_F(DryRun, showsNamesSoThatALineIsOneChange) {
    folder_.addFile("two\nlines");
    folder_.addFile("a b");

    expectShown({"add", "two\nlines", "a b"}, "add a b\nadd \"two\\nlines\"\n");
    EXPECT_THAT(toolFrom("src/io", {"add", "--dry-run", "new.cpp", "../../a b"}),
                Prints("add ../../a b\nadd new.cpp\n"));
    EXPECT_THAT(toolFrom("src/io", {"add", "--dry-run", "--full-name", "new.cpp"}),
                Prints("add src/io/new.cpp\n"));
}

TEST_F(DryRun, showsNothingForTheDataOfAFileThatHasALine) {
    insertLineBefore("\"src/\"", R"({"at":["Files","Root","File","a","LabelData","Data"],)"
                                 R"("children":[{"type":"Record","keys":{"UUID":"x","Value":"y"}}]})");
    insertLineBefore("\"src/\"", R"({"at":["Files","Notes","File","a"],"keys":{"Note":"new"}})");
    ASSERT_EQ(tool({"tidy"}).exitCode, 0);

    expectShown({"remove", "a"}, "remove a\n");
}

TEST_F(DryRun, failsAsTheCommandWould) {
    auto const before = snapshot();

    EXPECT_THAT(tool({"add", "--dry-run", "src/io/new.cpp", "missing"}), FailsWith(1, inFolder("missing")));
    EXPECT_THAT(tool({"remove", "--dry-run", "missing"}), FailsWith(1, inFolder("missing")));
    EXPECT_THAT(tool({"label", "put", "--dry-run", "Status", "Late", "a"}), FailsWith(1, "Late"));
    EXPECT_THAT(tool({"batch", "--dry-run"}, "remove a\nremove a\n"), FailsWith(1, "line 2: "));

    EXPECT_EQ(snapshot(), before);
}

TEST_F(DryRun, worksWhileTheIndexIsLocked) {
    folder_.addFile(".git/index.lock");

    expectShown({"remove", "a"}, "remove a\n");
}

TEST_F(DryRun, confirmsNothingOnATerminal) {
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"remove", "--dry-run", "a"}).output, "remove a\r\n");
}

TEST_F(DryRun, isNotAnOptionOfALineOfABatch) {
    EXPECT_THAT(tool({"batch"}, "remove --dry-run a\n"), FailsWith(2, "applies to the whole batch"));
}

} // namespace
} // namespace project::test

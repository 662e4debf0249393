#include <csignal>
#include <filesystem>
#include <fstream>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

/// A project with two files, and a `watch` of it.
class WatchCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"src/pump.cpp");
        folder_.file(u"valve.cpp");
        ASSERT_EQ(tool({"add", "-r", "src"}).exitCode, 0);
        ASSERT_EQ(tool({"category", "create", "Status"}).exitCode, 0);
    }

    /// A `watch` that is running.
    std::unique_ptr<RunningProgram> watch(std::vector<std::string> options = {}) const {
        options.insert(options.begin(), "watch");
        auto watching = std::make_unique<RunningProgram>(commandFor(options), settings_);
        bool const isJson = std::ranges::count(options, "--json") > 0;
        EXPECT_EQ(watching->readLine(),
                  isJson ? R"({"event": "ready", "format": "projectctl-watch", "version": 2})" : "ready\t2");
        return watching;
    }

    /// The line that a `watch` prints for another command.
    std::string printed(RunningProgram& watching, std::vector<std::string> command,
                        std::string_view input = {}) const {
        auto const result = tool(std::move(command), input);
        EXPECT_EQ(result.exitCode, 0) << result.errors;
        return watching.readLine();
    }

    static ProgramResult interrupt(RunningProgram& watching) {
        watching.sendSignal(SIGINT);
        return watching.finish();
    }
};

TEST_F(WatchCommand, printsEachEventInALine) {
    auto const watching = watch();

    EXPECT_EQ(printed(*watching, {"add", "valve.cpp"}), "fileListUpdate\tvalve.cpp");
    EXPECT_EQ(printed(*watching, {"remove", "src"}), "fileListUpdate\tsrc\tsrc/pump.cpp");
    EXPECT_EQ(printed(*watching, {"category", "create", "Owner"}), "categoryAdded\tOwner");
    EXPECT_EQ(printed(*watching, {"category", "rename", "Owner", "Keeper"}), "categoryRenamed\tOwner");
    EXPECT_EQ(printed(*watching, {"label", "create", "Status", "Done"}), "labelModified\tStatus\tDone");
    EXPECT_EQ(printed(*watching, {"label", "put", "Status", "Done", "valve.cpp"}),
              "fileLabelsChanged\tvalve.cpp");
    EXPECT_EQ(printed(*watching, {"name", "Engine"}), "nameChanged");
    EXPECT_EQ(printed(*watching, {"description", "Pumps"}), "metadataChange");
    EXPECT_EQ(printed(*watching, {"entry", "set", "valve.cpp"}), "entryPointsChanged");
    EXPECT_EQ(printed(*watching, {"path", "add", "."}), "pathChanged");
    EXPECT_EQ(printed(*watching, {"reference", "add", "."}), "referencesChanged");
    EXPECT_EQ(printed(*watching, {"category", "delete", "Keeper"}), "categoryDeleted\tKeeper");
    EXPECT_EQ(interrupt(*watching).signal, SIGINT);
}

TEST_F(WatchCommand, printsEachEventAsAJsonObject) {
    auto const watching = watch({"--json"});

    EXPECT_EQ(printed(*watching, {"add", "valve.cpp"}),
              R"({"event": "fileListUpdate", "files": ["valve.cpp"]})");
    EXPECT_EQ(printed(*watching, {"remove", "src"}),
              R"({"event": "fileListUpdate", "files": ["src", "src/pump.cpp"]})");
    EXPECT_THAT(printed(*watching, {"category", "create", "Owner"}),
                testing::MatchesRegex(R"(\{"event": "categoryAdded", "category": \{"uuid": "[-0-9a-f]+", )"
                                      R"("name": "Owner"\}\})"));
    EXPECT_THAT(printed(*watching, {"label", "create", "Status", "Done"}),
                testing::MatchesRegex(R"(\{"event": "labelModified", "category": \{"uuid": "[-0-9a-f]+", )"
                                      R"("name": "Status"\}, "label": \{"uuid": "[-0-9a-f]+", )"
                                      R"("name": "Done"\}\})"));
    EXPECT_EQ(printed(*watching, {"name", "Engine"}), R"({"event": "nameChanged"})");
}

TEST_F(WatchCommand, marksEventsOfThePersonalLayer) {
    auto const watching = watch();

    EXPECT_EQ(printed(*watching, {"category", "create", "Mine", "--personal"}),
              "personal categoryAdded\tMine");
    EXPECT_EQ(printed(*watching, {"label", "create", "Mine", "Later", "--personal"}),
              "personal labelModified\tMine\tLater");
    EXPECT_EQ(printed(*watching, {"label", "put", "Mine", "Later", "src/pump.cpp", "--personal"}),
              "personal fileLabelsChanged\tsrc/pump.cpp");
    EXPECT_EQ(printed(*watching, {"name", "Engine"}), "nameChanged");
}

TEST_F(WatchCommand, writesEventsThatFollowTheirSchema) {
    auto const watching = watch({"--json"});
    std::string documents;
    for (auto const& command :
         std::vector<std::vector<std::string>>{{"add", "valve.cpp"},
                                               {"category", "create", "Owner"},
                                               {"label", "create", "Status", "Done"},
                                               {"category", "create", "Mine", "--personal"},
                                               {"name", "Engine"}}) {
        documents += printed(*watching, command) + '\n';
    }
    EXPECT_THAT(documents, testing::HasSubstr("\"name\": \"Mine\"}, \"personal\": true}"));
    expectValid(documents + R"({"event": "ready", "format": "projectctl-watch", "version": 2})");
}

TEST_F(WatchCommand, runsACommandForEachGroupOfEventsAndContinuesIfItFails) {
    auto const watching = watch({"--exec", "sed 's/^/got /'; exit 3"});

    EXPECT_EQ(printed(*watching, {"batch"}, "add valve.cpp\nname Engine\n"), "got nameChanged");
    EXPECT_EQ(watching->readLine(), "got fileListUpdate\tvalve.cpp");
    EXPECT_EQ(watching->readErrorLine(),
              "projectctl: warning: the command of --exec has failed with the exit code 3");
    EXPECT_EQ(printed(*watching, {"name", "Motor"}), "got nameChanged");
}

TEST_F(WatchCommand, passesAnyNumberOfEventsToACommandThatDoesNotReadThem) {
    auto const watching = watch({"--exec", "echo done"});

    EXPECT_EQ(printed(*watching, {"name", "Motor"}), "done");
    EXPECT_EQ(printed(*watching, {"name", "Engine"}), "done");
}

TEST_F(WatchCommand, keepsANameWithALineFeedInOneLine) {
    folder_.addFile("two\nlines");
    auto const watching = watch();

    EXPECT_EQ(printed(*watching, {"add", "two\nlines"}), "fileListUpdate\t\"two\\nlines\"");
}

TEST_F(WatchCommand, reportsTheChangesOfAnEditor) {
    auto const watching = watch();
    insertLineBefore("\"src/pump.cpp\"", "\"src/a.cpp\"");

    EXPECT_EQ(watching->readLine(), "fileListUpdate\tsrc/a.cpp");
}

TEST_F(WatchCommand, continuesAfterATextThatCouldNotBeRead) {
    auto const watching = watch();
    auto const good = readText();
    std::filesystem::rename(text(), folder_.onDisk() / "aside");
    writeText("hello\n");
    ASSERT_NE(watching->readErrorLine().find("project.jsonl"), std::string::npos);
    std::filesystem::rename(folder_.onDisk() / "aside", text());

    EXPECT_EQ(printed(*watching, {"name", "Engine"}), "nameChanged");
    EXPECT_EQ(interrupt(*watching).errors, "");
}

TEST_F(WatchCommand, endsWithoutAMessageWhenItsOutputIsClosed) {
    auto const watching = watch();
    ASSERT_EQ(tool({"name", "Engine"}).exitCode, 0);
    watching->readAndClose(1);
    ASSERT_EQ(tool({"name", "Pump"}).exitCode, 0);

    auto const result = watching->finish();

    EXPECT_EQ(result.signal, SIGPIPE);
    EXPECT_EQ(result.errors, "");
}

TEST_F(WatchCommand, failsOutsideAProject) {
    std::filesystem::remove_all(folder_.onDisk() / ".projectdata");

    EXPECT_THAT(tool({"watch"}), FailsWith(1, "project"));
}

} // namespace
} // namespace project::test

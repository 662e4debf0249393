#include <cstdlib>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

class ReportCommand : public ToolTest {
protected:
    void SetUp() override {
        settings_.folder = folder_.onDisk() / "engine";
        folder_.file(u"engine/src/main.cpp", "int main() {}\n");
        ASSERT_EQ(tool({"init", "--name", "Engine"}).exitCode, 0);
        ASSERT_EQ(tool({"add", "-r", "src"}).exitCode, 0);
    }

    std::string read(std::string const& name) const {
        std::ifstream file(folder_.onDisk() / name, std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    /// The page after another call of the tool.
    std::string page(std::vector<std::string> options = {}) const {
        options.insert(options.begin(), {"report", "--output", "../page.html"});
        EXPECT_THAT(tool(options), SucceedsSilently());
        return read("page.html");
    }

    std::vector<std::string> names(std::string const& folder) const {
        std::vector<std::string> result;
        for (auto const& entry : std::filesystem::directory_iterator(folder_.onDisk() / folder)) {
            result.push_back(entry.path().filename().string());
        }
        std::ranges::sort(result);
        return result;
    }

    void runGit(std::string const& arguments) const {
        auto const result = runProgram(
            {"bash", "-c", "git -c user.name=Ada -c user.email=ada@example.org " + arguments}, settings_);
        ASSERT_EQ(result.exitCode, 0) << result.errors;
    }

    void commitAll() const {
        runGit("init -q");
        runGit("add -A");
        runGit("commit -qm first");
    }
};

TEST_F(ReportCommand, writesOnePageIntoTheCurrentFolder) {
    EXPECT_THAT(toolFrom("src", {"report"}), SucceedsSilently());

    EXPECT_THAT(names("engine/src"), ElementsAre("main.cpp", "project-report.html"));
    auto const written = read("engine/src/project-report.html");
    EXPECT_THAT(written, StartsWith("<!DOCTYPE html>\n<html lang=\"en\">"));
    EXPECT_THAT(written, HasSubstr("\"name\":\"Engine\""));
    EXPECT_THAT(written, Not(HasSubstr("{{")));
}

TEST_F(ReportCommand, saysOnATerminalWhatItHasWritten) {
    settings_.onTerminal = true;

    EXPECT_THAT(tool({"report"}).output, HasSubstr("project-report.html\" written: a page with 1 file, "));
}

TEST_F(ReportCommand, givesTheSameBytesForTheSameProject) {
    auto const first = page();
    EXPECT_EQ(page(), first);

    std::filesystem::copy(folder_.onDisk() / "engine", folder_.onDisk() / "copy",
                          std::filesystem::copy_options::recursive);
    settings_.folder = folder_.onDisk() / "copy";
    EXPECT_EQ(page(), first);
}

TEST_F(ReportCommand, doesNotReportItsOwnPageAsANewFile) {
    ASSERT_THAT(tool({"report"}), SucceedsSilently());
    auto const first = read("engine/project-report.html");
    ASSERT_THAT(tool({"report"}), SucceedsSilently());

    EXPECT_EQ(read("engine/project-report.html"), first);
    EXPECT_THAT(first, HasSubstr("\"findings\":[]"));
}

TEST_F(ReportCommand, keepsTheOldPageIfTheNewOneCannotBeWritten) {
    auto const old = page();
    ASSERT_EQ(tool({"name", "Another"}).exitCode, 0);
    settings_.fileSize = 5000;

    EXPECT_THAT(tool({"report", "--output", "../page.html"}), FailsWith(1, "page.html\" cannot be written"));

    EXPECT_EQ(read("page.html"), old);
    EXPECT_THAT(names(""), ElementsAre("engine", "page.html"));
}

TEST_F(ReportCommand, namesAFolderThatDoesNotExist) {
    EXPECT_THAT(tool({"report", "--output", "nowhere/page.html"}), FailsWith(1, "No such file or directory"));
}

TEST_F(ReportCommand, changesNothingInTheProject) {
    auto const before = names("engine/.projectdata");
    std::ifstream text(settings_.folder / ".projectdata/project.jsonl");
    std::string const content{std::istreambuf_iterator<char>(text), {}};

    page();

    EXPECT_EQ(names("engine/.projectdata"), before);
    EXPECT_EQ(read("engine/.projectdata/project.jsonl"), content);
}

TEST_F(ReportCommand, doesNotRunInABatch) {
    EXPECT_EQ(tool({"batch"}, "name Other\nreport\n").exitCode, 2);
    EXPECT_THAT(names("engine"), ElementsAre(".projectdata", "src"));
}

TEST_F(ReportCommand, hasWhatCheckAndStatusFind) {
    folder_.file(u"engine/new.txt");
    folder_.remove(u"engine/src/main.cpp");

    auto const written = page();

    EXPECT_THAT(written, HasSubstr(R"("code":"new","isFault":false,"text":"","path":"new.txt")"));
    EXPECT_THAT(written, HasSubstr(R"("code":"gone","isFault":false,"text":"","path":"src/main.cpp")"));
}

TEST_F(ReportCommand, listsSomeFindingsOfACodeAndCountsTheOthers) {
    for (int i = 0; i < 1005; ++i) {
        folder_.addFile("engine/new" + std::to_string(i));
    }

    EXPECT_THAT(page(), HasSubstr("\"omittedFindings\":5"));
    EXPECT_THAT(tool({"report", "--json", "--output", "../page.html"}).output,
                HasSubstr("\"findings\": 1005"));
}

TEST_F(ReportCommand, showsADamagedDefinitionToo) {
    std::ofstream(settings_.folder / ".projectdata/project.jsonl", std::ios::app) << "damaged\n\"x\"\n";

    auto const result = tool({"report", "--output", "../page.html"});

    EXPECT_EQ(result.exitCode, 0) << result.errors;
    EXPECT_THAT(read("page.html"), HasSubstr("\"code\":\"text-torn-tail\""));
}

TEST_F(ReportCommand, hasTheHistoryOfTheText) {
    commitAll();
    ASSERT_EQ(tool({"remove", "src/main.cpp"}).exitCode, 0);
    runGit("commit -qam second");

    auto const written = page();

    EXPECT_THAT(written, HasSubstr(R"("author":"Ada","subject":"first","files":1,"folders":1,"labels":[]})"));
    EXPECT_THAT(written,
                HasSubstr(R"("author":"Ada","subject":"second","files":0,"folders":1,"labels":[]})"));
    EXPECT_THAT(page({"--no-source-control"}), HasSubstr("\"versions\":[]"));
}

TEST_F(ReportCommand, readsSomeVersionsOfALongHistory) {
    commitAll();
    for (int i = 0; i < 70; ++i) {
        ASSERT_EQ(tool({"name", "Name " + std::to_string(i)}).exitCode, 0);
        runGit("commit -qam " + std::to_string(i));
    }

    auto const written = page();

    EXPECT_THAT(written, HasSubstr("\"omitted\":7"));
    EXPECT_THAT(written, HasSubstr("\"subject\":\"first\",\"files\""));
    EXPECT_THAT(written, HasSubstr("\"subject\":\"69\",\"files\""));
}

TEST_F(ReportCommand, comparesWithARevision) {
    commitAll();
    ASSERT_EQ(
        tool({"batch"}, "remove src/main.cpp\ncategory create Status\nlabel create Status Open\n").exitCode,
        0);

    auto const written = page({"--compare", "HEAD"});

    EXPECT_THAT(written, HasSubstr("\"changes\":[0,2]"));
    EXPECT_THAT(written,
                HasSubstr(R"("other":[{"what":"category","change":"added","name":"Status"},)"
                          R"({"what":"label","change":"added","name":"Open","category":"Status"}])"));
}

TEST_F(ReportCommand, followsARenamedFileAndItsLabelsInAComparison) {
    folder_.file(u"engine/src/old.cpp", "one\ntwo\nthree\nfour\n");
    ASSERT_EQ(tool({"batch"}, "add src/old.cpp\ncategory create Status\nlabel create Status Open\n"
                              "label put Status Open src/old.cpp\n")
                  .exitCode,
              0);
    commitAll();
    ASSERT_THAT(tool({"move", "src/old.cpp", "src/new.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "take", "Status", "Open", "src/new.cpp"}), SucceedsSilently());

    auto const written = page({"--compare", "HEAD"});

    EXPECT_THAT(written, HasSubstr("\"changes\":[0,0,5]")); // src, main.cpp, new.cpp
    EXPECT_THAT(written, HasSubstr(R"("labelsBefore":[[2,1]],"pathsBefore":[[2,"src/old.cpp"]],"other":[])"));
}

TEST_F(ReportCommand, regardsATouchedFileAsUnchanged) {
    commitAll();
    auto const main = settings_.folder / "src/main.cpp";
    std::filesystem::last_write_time(main, std::filesystem::last_write_time(main) - std::chrono::hours(1));

    EXPECT_THAT(page({"--compare", "HEAD"}), HasSubstr("\"changes\":[0,0]"));

    std::ofstream(main, std::ios::app) << "// more\n";
    EXPECT_THAT(page({"--compare", "HEAD"}), HasSubstr("\"changes\":[0,4]"));
}

TEST_F(ReportCommand, followsAProjectThatWasMovedInItsRepository) {
    settings_.folder = folder_.onDisk();
    runGit("init -q");
    runGit("add -A");
    runGit("commit -qm first");
    runGit("mv engine motor");
    runGit("commit -qm moved");
    settings_.folder = folder_.onDisk() / "motor";

    auto const written = page();

    EXPECT_THAT(written, HasSubstr("\"subject\":\"first\",\"files\":1"));
    EXPECT_THAT(written, HasSubstr("\"subject\":\"moved\",\"files\":1"));
    EXPECT_THAT(written, HasSubstr("\"omitted\":0"));
}

TEST_F(ReportCommand, hasNoHistoryBeforeTheFirstCommit) {
    runGit("init -q");

    EXPECT_THAT(page(), HasSubstr("\"versions\":[]"));
}

TEST_F(ReportCommand, refusesARevisionThatItCannotCompareWith) {
    auto const compare = [this](std::string const& revision) {
        return tool({"report", "--output", "../page.html", "--compare", revision});
    };
    EXPECT_THAT(compare("HEAD"), FailsWith(1, "git has no history of it"));
    runGit("init -q");
    EXPECT_THAT(compare("HEAD"), FailsWith(1, "git knows no commit \"HEAD\""));
    runGit("commit -q --allow-empty -m empty");
    EXPECT_THAT(compare("--help"), FailsWith(1, "git knows no commit \"--help\""));
    EXPECT_THAT(compare("HEAD"), FailsWith(1, "\"HEAD\" has no definition of this project"));
    EXPECT_THAT(tool({"report", "--no-source-control", "--compare", "HEAD"}),
                FailsWith(1, "git has no history of it"));
    EXPECT_THAT(names(""), ElementsAre("engine"));
}

TEST_F(ReportCommand, leavesPersonalLabelsOut) {
    auto const before = page();
    for (auto const& command : {std::vector<std::string>{"category", "create", "--personal", "Mine"},
                                {"label", "create", "--personal", "Mine", "Secret"},
                                {"label", "put", "--personal", "Mine", "Secret", "src/main.cpp"}}) {
        ASSERT_THAT(tool(command), SucceedsSilently());
    }

    EXPECT_EQ(page(), before);
}

TEST_F(ReportCommand, opensThePageWithTheDesktopsProgram) {
    auto const programs = folder_.onDisk() / "programs";
    std::filesystem::create_directory(programs);
    std::ofstream(programs / "xdg-open")
        << "#!/bin/sh\nprintf '%s' \"$1\" >" << folder_.onDisk() / "opened" << '\n';
    std::filesystem::permissions(programs / "xdg-open", std::filesystem::perms::all);
    settings_.environment["PATH"] = programs.string() + ":/usr/bin:/bin";

    EXPECT_THAT(tool({"report", "--output", "../page.html", "--open"}), SucceedsSilently());
    EXPECT_EQ(read("opened"), inFolder("page.html"));

    std::ofstream(programs / "xdg-open") << "#!/bin/sh\nexit 3\n";
    EXPECT_THAT(tool({"report", "--output", "../page.html", "--open"}), FailsWith(1, "cannot be opened"));
}

TEST_F(ReportCommand, speaksTheLanguageOfTheTool) {
    settings_.environment["LC_ALL"] = "de_AT.UTF-8";

    auto const written = page();

    EXPECT_THAT(written, HasSubstr("<html lang=\"de\">"));
    EXPECT_THAT(written, HasSubstr("\"Files\":\"Dateien\""));
    EXPECT_THAT(written, HasSubstr("\"FirstOf\":\"Die ersten {0} von {1}\""));
}

} // namespace
} // namespace project::test

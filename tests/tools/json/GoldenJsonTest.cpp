#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"
#include "tools/json/GoldenDocument.hpp"

namespace project::test {
namespace {

/// A project in which every verb has something to write.
class GoldenJson : public ToolTest {
protected:
    void SetUp() override {
        settings_.folder = folder_.onDisk() / "engine";
        for (auto const* name : {u"engine/src/io/pump.cpp", u"engine/src/main.cpp", u"engine/src/gone"}) {
            folder_.file(name);
        }
        folder_.addFile("engine/odd\xFF\nname");
        folder_.folder(u"pump");
    }

    void expectGolden(std::string const& document) const {
        GoldenDocument({{folder_.onDisk().string(), "/FOLDER"}, {PROJECTCTL_VERSION, "0.0.0"}})
            .expect(document);
    }

    /// The size of the page varies with its texts and scripts.
    void goldenReport() const {
        auto const page = folder_.onDisk() / "report.html";
        auto const result = tool({"report", "--output", page.string(), "--json"});
        EXPECT_EQ(result.errors, "");
        auto const size = std::to_string(std::filesystem::file_size(page));
        GoldenDocument({{folder_.onDisk().string(), "/FOLDER"}, {"\"bytes\": " + size, "\"bytes\": 0"}})
            .expect(result.output);
    }

    void golden(std::vector<std::string> command, std::string_view input = {}) const {
        command.emplace_back("--json");
        auto const result = tool(command, input);
        EXPECT_EQ(result.errors, "") << ::testing::PrintToString(command);
        expectGolden(result.output);
    }
};

TEST_F(GoldenJson, everyVerbWritesTheDocumentOfItsVersion) {
    golden({"init", "--name", "Engine"});
    golden({"add", "--recursive", "."});
    ASSERT_THAT(tool({"batch"}, "description Pumps\ncategory create Status --single-valued --read-only\n"
                                "category create Owner --type Text\nlabel create Status Open\n"
                                "label create Status Done --writable\nlabel create Owner Ann\n"
                                "label put Status Open src/main.cpp\nlabel put Owner Ann src/main.cpp src\n"
                                "group create Nightly\nreference add ../pump\nreference add --absolute .\n"
                                "entry set src/main.cpp --type Startup --group Nightly --extension k=v\n"),
                SucceedsSilently());
    golden({"--version"});
    golden({"root"});
    golden({"name"});
    golden({"description"});
    golden({"list"});
    golden({"category", "list"});
    golden({"label", "list"});
    golden({"label", "show", "src/main.cpp", "src"});
    golden({"entry", "list"});
    golden({"group", "list"});
    golden({"reference", "list"});
    golden({"export", "jsonl"});
    golden({"help", "root"});
    goldenReport();
    golden({"batch", "--dry-run"},
           "name Motor\nlabel create Owner Bob\nlabel put Owner Bob src/io\nremove src/gone\n"
           "entry remove src/main.cpp\npath add src\ngroup delete Nightly\ncategory rename Owner Keeper\n");
}

TEST_F(GoldenJson, findingsAndErrorsHaveTheDocumentsOfTheirVersions) {
    ASSERT_EQ(tool({"init"}).exitCode, 0);
    ASSERT_EQ(tool({"batch"},
                   "add -r .\ncategory create Status\nlabel create Status Open\n"
                   "label put Status Open src/main.cpp\nentry set src/gone\nreference add ../pump\n")
                  .exitCode,
              0);
    auto const text = settings_.folder / ".projectdata" / "project.jsonl";
    std::ifstream file(text, std::ios::binary);
    std::string content{std::istreambuf_iterator<char>(file), {}};
    auto const label = content.rfind("\"Label\",\"keys\":{\"UUID\":\"");
    ASSERT_NE(label, std::string::npos);
    content.replace(label + 24, 36, "another");
    std::ofstream(text, std::ios::binary | std::ios::trunc) << content;
    folder_.remove(u"engine/src/gone");
    folder_.addFile("engine/new");

    golden({"status"});
    golden({"status", "--renames"});
    auto const check = tool({"check", "--json"});
    EXPECT_EQ(check.exitCode, 3);
    expectGolden(check.output);
    auto const graph = tool({"references", "--graph", "--json"});
    EXPECT_EQ(graph.exitCode, 3);
    expectGolden(graph.output);
    expectGolden(tool({"remove", "nothing", "--json"}).errors);
}

TEST_F(GoldenJson, synchronisationsHaveTheDocumentsOfTheirVersions) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_EQ(tool({"batch"},
                   "add -r src\ncategory create Status\nlabel create Status Open\n"
                   "label put Status Open src/gone\nentry set src/gone\n"
                   "sync --rule src --include '**/*.c' --include '*.h' --exclude out --no-gitignore\n"
                   "sync --rule .\n")
                  .exitCode,
              0);
    folder_.remove(u"engine/src/gone");
    folder_.addFile("engine/src/io/new.c");

    golden({"sync", "--rules"});
    golden({"sync"});
}

TEST_F(GoldenJson, ofImportAndExportListEverythingThatHasNoCounterpart) {
    ASSERT_EQ(tool({"init"}).exitCode, 0);
    auto const import =
        tool({"import", "csv", "--json"},
             "path,category,label\nsrc/main.cpp,Owner,@ann\nsrc/main.cpp,Owner,@ben\n../no,,\n");
    EXPECT_EQ(import.exitCode, 3);
    EXPECT_EQ(import.errors, "");
    expectGolden(import.output);
    golden({"export", "codeowners"});
}

TEST_F(GoldenJson, ofResolveShowsTheConflicts) {
    GitFolder const git(settings_.folder);
    ASSERT_EQ(tool({"init"}).exitCode, 0);
    git.commitAll();
    git.run({"switch", "-qc", "theirs"});
    ASSERT_EQ(tool({"name", "Theirs"}).exitCode, 0);
    git.commitAll();
    git.run({"switch", "-q", "-"});
    ASSERT_EQ(tool({"name", "Ours"}).exitCode, 0);
    git.commitAll();
    git.tryTo({"merge", "-q", "theirs"});

    golden({"resolve", "--ours"});
}

TEST_F(GoldenJson, ofLogAndDiffShowEachKindOfChange) {
    GitFolder const git(settings_.folder, {{"GIT_AUTHOR_DATE", "2000-01-01T00:00:00Z"}});
    std::ofstream(settings_.folder / "src/main.cpp") << "int main() {}\n";
    std::ofstream(settings_.folder / "src/gone") << "nothing\n";
    ASSERT_EQ(tool({"init"}).exitCode, 0);
    ASSERT_THAT(tool({"batch"}, "add src/main.cpp src/gone\ncategory create Owner\ngroup create Weekly\n"),
                SucceedsSilently());
    git.commitAll();
    ASSERT_EQ(tool({"move", "src/main.cpp", "src/start.cpp"}).exitCode, 0);
    ASSERT_THAT(tool({"batch"}, "name Motor\ndescription Turns\nremove src/gone\nadd src/io/pump.cpp\n"
                                "category rename Owner Keeper\nlabel create Keeper Ann\n"
                                "label put Keeper Ann src/start.cpp\nentry set src/start.cpp\n"
                                "group delete Weekly\npath add src\nreference add ../pump\n"),
                SucceedsSilently());
    golden({"diff"});
    git.commitAll();

    auto const log = tool({"log", "--json"});
    EXPECT_EQ(log.errors, "");
    expectGolden(std::regex_replace(log.output, std::regex("[0-9a-f]{40}"), "COMMIT"));
}

TEST_F(GoldenJson, ofWatchShowsEachEvent) {
    ASSERT_EQ(tool({"init"}).exitCode, 0);
    ASSERT_EQ(tool({"add", "src/main.cpp"}).exitCode, 0);
    ASSERT_EQ(tool({"category", "create", "Owner"}).exitCode, 0);
    RunningProgram watching(commandFor({"watch", "--json"}), settings_);
    std::string events = watching.readLine() + '\n';
    auto const afterCommand = [&](std::vector<std::string> const& command) {
        EXPECT_EQ(tool(command).exitCode, 0) << ::testing::PrintToString(command);
        events += watching.readLine() + '\n';
    };

    afterCommand({"add", "src/io/pump.cpp"});
    afterCommand({"category", "create", "Status"});
    afterCommand({"label", "create", "Status", "Open"});
    afterCommand({"label", "put", "Status", "Open", "src/main.cpp"});
    afterCommand({"category", "rename", "Status", "State"});
    afterCommand({"entry", "set", "src/main.cpp"});
    afterCommand({"name", "Motor"});
    afterCommand({"path", "add", "src"});
    afterCommand({"reference", "add", "../pump"});
    afterCommand({"description", "Turns"});
    afterCommand({"category", "delete", "Owner"});

    expectValid(events);
    expectGolden(events);
}

} // namespace
} // namespace project::test

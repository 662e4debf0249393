#include <cstdlib>
#include <map>
#include <regex>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

/// A project in which every verb has something to write. Its documents are compared with files that never
/// change: a document of another form needs a new version.
///
/// With PROJECT_WRITE_GOLDEN in the environment, missing files are written.
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

    /// UUIDs, the folder and the version of the tool differ in each run, and sentences are for people.
    std::string normalised(std::string text) const {
        std::map<std::string, std::string> names;
        std::regex const uuid("[0-9a-f]{8}(-[0-9a-f]{4}){3}-[0-9a-f]{12}");
        for (std::smatch match; std::regex_search(text, match, uuid);) {
            auto const& name = names.emplace(match[0], "UUID-" + std::to_string(names.size())).first->second;
            text = match.prefix().str() + name + match.suffix().str();
        }
        for (auto const& [from, to] : {std::pair(folder_.onDisk().string(), std::string("/FOLDER")),
                                       {std::string(PROJECTCTL_VERSION), std::string("0.0.0")}}) {
            for (auto at = text.find(from); at != std::string::npos; at = text.find(from, at)) {
                text.replace(at, from.size(), to);
            }
        }
        return std::regex_replace(text, std::regex(R"re("text": "(\\.|[^"\\])*")re"), "\"text\": \"...\"");
    }

    /// Compares a document with the file of its format and version.
    void expectGolden(std::string const& document) const {
        std::smatch head;
        ASSERT_TRUE(std::regex_search(document, head,
                                      std::regex(R"re(^\{"format": "([a-z-]+)", "version": (\d+))re")))
            << document;
        auto const name = head[1].str() + '-' + head[2].str() + ".json";
        auto const file = std::filesystem::path(GOLDEN_JSON) / name;
        auto const text = normalised(document);
        if (!std::filesystem::exists(file) && std::getenv("PROJECT_WRITE_GOLDEN") != nullptr) {
            std::ofstream(file, std::ios::binary) << text;
        }
        std::ifstream stored(file, std::ios::binary);
        EXPECT_EQ(text, std::string(std::istreambuf_iterator<char>(stored), {}))
            << name << " is another document. If that is intended, give the format a new version.";
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

} // namespace
} // namespace project::test

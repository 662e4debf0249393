#include <set>

#include <rapidcheck.h>

#include "tools/labels/LabelToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

class ExportCommand : public LabelToolTest {};

TEST_F(ExportCommand, writesFilesWithTheirLabels) {
    createLabelled("Status", "Open, \"new\"", "a");

    EXPECT_THAT(tool({"export", "csv"}),
                Prints("path,category,label,data\r\na,Status,\"Open, \"\"new\"\"\",\r\n"
                       "b,,,\r\nc,,,\r\n"));
    EXPECT_THAT(tool({"export", "jsonl"}),
                Prints("{\"path\": \"a\", \"category\": \"Status\", \"label\": \"Open, \\\"new\\\"\"}\n"
                       "{\"path\": \"b\"}\n{\"path\": \"c\"}\n"));
}

TEST_F(ExportCommand, writesPathsOfFilesOnly) {
    folder_.addFile("dir/line\nbreak");
    ASSERT_THAT(tool({"add", "-r", "dir"}), SucceedsSilently());

    EXPECT_THAT(tool({"export", "files"}), Prints("a\nb\nc\ndir/line\nbreak\n"));
    EXPECT_THAT(toolFrom("dir", {"export", "files", "-0"}),
                Prints(withZeros({"a", "b", "c", "dir/line\nbreak"})));
}

TEST_F(ExportCommand, listsOwnersThatCodeOwnersCannotHave) {
    folder_.addFile("dir/line\nbreak");
    ASSERT_THAT(tool({"add", "-r", "dir"}), SucceedsSilently());
    createLabelled("Owner", "@ann", "a");
    ASSERT_THAT(tool({"label", "put", "Owner", "@ann", "dir", "dir/line\nbreak"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Owner", "Ben"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Ben", "b"}), SucceedsSilently());

    auto const result = tool({"export", "codeowners"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_EQ(result.output, "/a @ann\n");
    EXPECT_THAT(linesOf(result.errors),
                ElementsAre(HasSubstr("\"Ben\", the owner of \"b\", is not a user"),
                            HasSubstr("\"dir\" is a folder"), HasSubstr("has a line end")));
}

TEST_F(ExportCommand, listsLabelsThatWereDeleted) {
    createLabelled("Status", "Open", "a");
    auto const uuid = labelUUID("Open");
    auto const content = readText();
    auto const definition = content.find("\"Label\",\"" + uuid);
    ASSERT_NE(definition, std::string::npos) << content;
    auto const begin = content.rfind('\n', definition) + 1;
    writeText(std::string(content).erase(begin, content.find('\n', definition) + 1 - begin));

    auto const result = tool({"export", "jsonl"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_EQ(result.output, "{\"path\": \"a\"}\n{\"path\": \"b\"}\n{\"path\": \"c\"}\n");
    EXPECT_THAT(linesOf(result.errors), ElementsAre(HasSubstr("\"a\" has a label that was deleted")));
}

/// Names of files, categories, labels and owners, and data, with everything that needs quotes.
rc::Gen<std::string> anyText(std::vector<std::string> const& parts) {
    return rc::gen::map(
        rc::gen::nonEmpty(rc::gen::container<std::vector<std::string>>(rc::gen::elementOf(parts))),
        [](std::vector<std::string> const& chosen) {
            std::string result = "n";
            for (auto const& part : chosen) {
                result += part;
            }
            return result.substr(0, 60);
        });
}

std::vector<std::string> const strange{
    "a", "*",    "?",    "[", "]", " ", "\t", "\"", "'", "\\", ",", "#", "\r", "\xC3\xA9", "\xF0\x9F\x98\x80",
    "!", "\xFF", "\x80", "-", "="};

/// A project and a second one with the same files on disk.
class RoundTrip : public ToolTest {
protected:
    static std::multiset<std::string> sorted(std::string const& text) {
        auto const lines = linesOf(text);
        return {lines.begin(), lines.end()};
    }

    /// Creates a project below the folder, with files.
    void create(std::string const& name, std::set<std::string> const& files) {
        settings_.folder = folder_.addFolder(name);
        for (auto const& file : files) {
            folder_.addFile(name + '/' + file);
        }
        RC_ASSERT(tool({"init"}).exitCode == 0);
    }

    /// Exports the first project, and imports it into the second one.
    void transfer(std::string const& first, std::string const& second, std::string const& form) {
        settings_.folder = folder_.onDisk() / first;
        auto const exported = tool({"export", form});
        RC_ASSERT(exported.exitCode == 0);
        settings_.folder = folder_.onDisk() / second;
        auto const imported = tool({"import", form, "-"}, exported.output);
        RC_ASSERT(imported.errors == "");
        RC_ASSERT(imported.exitCode == 0);
        RC_ASSERT(sorted(tool({"export", form}).output) == sorted(exported.output));
        auto const before = readTextOf(second);
        RC_ASSERT(tool({"import", form, "-"}, exported.output).exitCode == 0);
        RC_ASSERT(readTextOf(second) == before);
    }

    std::string readTextOf(std::string const& name) const {
        std::ifstream file(folder_.onDisk() / name / ".projectdata" / "project.jsonl", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    /// Whether enough projects were transferred: each of them takes a dozen processes.
    bool isEnough() const { return runs_ >= 20; }

    int runs_ = 0;
};

TEST_F(RoundTrip, ofTablesAndJsonLinesPreservesEverything) {
    auto names = strange;
    names.emplace_back("\n");
    ASSERT_TRUE(rc::check([&] {
        if (isEnough()) {
            return;
        }
        auto const files = *rc::gen::container<std::set<std::string>>(anyText(names));
        auto const first = "first" + std::to_string(++runs_);
        create(first, files);
        std::string table = "path,category,label,data\n";
        auto const quoted = [](std::string const& text) {
            std::string result = "\"";
            for (char const byte : text) {
                result += byte == '"' ? "\"\"" : std::string(1, byte);
            }
            return result + '"';
        };
        for (auto const& file : files) {
            table += quoted(file) + ',' + quoted(*anyText(names)) + ',' + quoted(*anyText(names)) + ',' +
                     quoted(*rc::gen::element(std::string(), *anyText(names))) + '\n';
        }
        RC_ASSERT(tool({"import", "csv"}, table).exitCode == 0);
        for (auto const* const form : {"csv", "jsonl"}) {
            auto const second = "second-" + std::string(form) + std::to_string(runs_);
            create(second, files);
            transfer(first, second, form);
        }
    }));
}

TEST_F(RoundTrip, ofCodeOwnersPreservesTheOwnersOfEachFile) {
    ASSERT_TRUE(rc::check([&] {
        if (isEnough()) {
            return;
        }
        auto const files = *rc::gen::container<std::set<std::string>>(anyText(strange));
        auto const owners = std::vector<std::string>{"@ann", "@team/docs", "ben@example.org"};
        auto const first = "first" + std::to_string(++runs_);
        auto const second = "second" + std::to_string(runs_);
        create(first, files);
        RC_ASSERT(tool({"add", "-r", "."}).exitCode == 0);
        RC_ASSERT(tool({"category", "create", "Owner"}).exitCode == 0);
        for (auto const& owner : owners) {
            RC_ASSERT(tool({"label", "create", "Owner", owner}).exitCode == 0);
            for (auto const& file : files) {
                if (*rc::gen::arbitrary<bool>()) {
                    RC_ASSERT(tool({"label", "put", "Owner", owner, "--", file}).exitCode == 0);
                }
            }
        }
        create(second, files);
        RC_ASSERT(tool({"add", "-r", "."}).exitCode == 0);
        transfer(first, second, "codeowners");
    }));
}

} // namespace
} // namespace project::test

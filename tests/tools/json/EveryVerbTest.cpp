#include <algorithm>
#include <map>
#include <regex>

#include "Verbs.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/ExitCode.hpp"
#include "cli/VerbDescription.hpp"
#include "tools/SampleProject.hpp"

namespace project::test {
namespace {

using projectctl::VerbDescription;
using ::testing::HasSubstr;
using ::testing::StartsWith;

constexpr char const* done = "projectctl-done"; ///< of verbs that only change the project

/// The format of the document of each verb.
std::map<std::string, std::string> const formats{
    {"init", "projectctl-init"},
    {"root", "projectctl-root"},
    {"name", "projectctl-name"},
    {"description", "projectctl-description"},
    {"add", done},
    {"remove", done},
    {"move", done},
    {"adopt", done},
    {"sync", done}, // of --rule, as in the example
    {"list", "projectctl-list"},
    {"status", "projectctl-status"},
    {"report", "projectctl-report"},
    {"import git", "projectctl-import"},
    {"import compile-commands", "projectctl-import"},
    {"import codeowners", "projectctl-import"},
    {"import csv", "projectctl-import"},
    {"import jsonl", "projectctl-import"},
    {"export csv", "projectctl-export"},
    {"export jsonl", "projectctl-export"},
    {"export codeowners", "projectctl-export-codeowners"},
    {"export files", "projectctl-list"},
    {"category create", done},
    {"category list", "projectctl-category-list"},
    {"category rename", done},
    {"category delete", done},
    {"label create", done},
    {"label list", "projectctl-label-list"},
    {"label delete", done},
    {"label put", done},
    {"label take", done},
    {"label show", "projectctl-label-show"},
    {"label find", "projectctl-list"},
    {"entry set", done},
    {"entry list", "projectctl-entry-list"},
    {"entry show", "projectctl-entry-list"},
    {"entry remove", done},
    {"group create", done},
    {"group list", "projectctl-group-list"},
    {"group rename", done},
    {"group delete", done},
    {"path add", done},
    {"path list", "projectctl-reference-list"},
    {"path remove", done},
    {"reference add", done},
    {"reference list", "projectctl-reference-list"},
    {"reference remove", done},
    {"references", "projectctl-reference-graph"},
    {"check", "projectctl-check"},
    {"tidy", done},
    {"setup", done},
    {"merge", done},
    {"resolve", "projectctl-resolve"},
    {"copy", done},
    {"shared status", "projectctl-shared-status"},
    {"shared tidy", "projectctl-shared-tidy"},
    {"shared log", "projectctl-shared-log"},
    {"shared roles", "projectctl-shared-roles"},
    {"log", "projectctl-log"},
    {"diff", "projectctl-diff"},
    {"batch", done},
    {"watch", "projectctl-watch"},
    {"help", "projectctl-help"},
};

/// The verbs that do something, without the groups.
std::vector<VerbDescription> callable(VerbDescription const& verb) {
    if (verb.members.empty()) {
        return {verb};
    }
    std::vector<VerbDescription> result;
    for (auto const& member : verb.members) {
        auto const below = callable(member);
        result.insert(result.end(), below.begin(), below.end());
    }
    return result;
}

/// The verbs for people and programs; git calls `textconv` and compares the lines that it writes.
std::vector<VerbDescription> allVerbs() {
    projectctl::DeclaredTool tool(projectctl::verbs());
    auto result = callable(projectctl::describe(tool.parser()));
    std::erase_if(result, [](auto const& verb) { return verb.name == "textconv"; });
    return result;
}

/// Whether a folder contains a file for a version of a format.
bool hasFile(std::filesystem::path const& folder, std::string const& format, std::string const& end) {
    std::regex const name(format + "-[0-9]+" + end);
    return std::ranges::any_of(std::filesystem::directory_iterator(folder), [&name](auto const& entry) {
        return std::regex_match(entry.path().filename().string(), name);
    });
}

TEST(JsonOfVerbs, hasAFormatWithASchemaAndAGoldenDocument) {
    auto const verbs = allVerbs();
    EXPECT_EQ(verbs.size(), formats.size());
    for (auto const& verb : verbs) {
        ASSERT_TRUE(formats.contains(verb.name)) << verb.name << " has no format";
        auto const& format = formats.at(verb.name);
        EXPECT_TRUE(std::ranges::any_of(verb.options, [](auto const& option) {
            return std::ranges::count(option.names, "--json") > 0;
        })) << verb.name;
        EXPECT_TRUE(hasFile(JSON_SCHEMAS, format, ".schema.json")) << format;
        EXPECT_TRUE(hasFile(GOLDEN_JSON, format, ".json")) << format;
    }
}

class JsonOfEveryVerb : public SampleProject {
protected:
    /// A call like the example of the help, with --json, which the last program of a pipe gets.
    static std::string withJson(std::string example) {
        // Their examples change the text, and write a tree.
        for (auto const* argument :
             {" 'Engine controller'", " 'Everything that runs on the controller'", " --tree"}) {
            auto const at = example.find("projectctl init") != std::string::npos ? std::string::npos
                                                                                 : example.find(argument);
            if (at != std::string::npos) {
                example.erase(at, std::string_view(argument).size());
            }
        }
        auto const end = std::min({example.size(), example.find(" >"), example.find(" -0 | xargs")});
        example.erase(end);
        return example.find("--json") == std::string::npos ? example + " --json" : example;
    }

    static bool needsServer(std::string const& verb) { return verb == "copy" || verb.starts_with("shared "); }
};

TEST_F(JsonOfEveryVerb, isADocumentOfItsFormat) {
    for (auto const& verb : allVerbs()) {
        auto const result = runInCopy(withJson(verb.example));

        expectValid(result.output + result.errors);
        if (needsServer(verb.name)) {
            EXPECT_EQ(result.exitCode, projectctl::exit_code::failed) << verb.name;
            EXPECT_THAT(result.errors, StartsWith("{\"format\": \"projectctl-message\"")) << verb.name;
        } else {
            std::string const format = verb.example.find("--dry-run") == std::string::npos
                                           ? formats.at(verb.name)
                                           : "projectctl-dry-run";
            EXPECT_THAT(result.output.substr(0, result.output.find('\n')),
                        HasSubstr("\"format\": \"" + format + "\", \"version\": "))
                << verb.example << '\n'
                << result.errors;
        }
    }
}

} // namespace
} // namespace project::test

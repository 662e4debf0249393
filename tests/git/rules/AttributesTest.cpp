#include <array>
#include <random>

#include "git/GitRepository.hpp"
#include "project/git/GitError.hpp"

namespace project::git {
namespace {

/// Files with a filter driver must be recognised: without the filter, a wrong content would be staged.
class Attributes : public GitTest {
protected:
    void SetUp() override {
        repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
        for (auto const& name : names) {
            repository.write(name);
        }
    }

    bool isRefused(std::string const& name) {
        try {
            adapter.addToSourceControl({repository.path(name)});
            return false;
        } catch (GitError const&) {
            return true;
        }
    }

    void expectAgreement(std::string const& done) {
        std::vector<std::string> command{"check-attr", "-z", "filter", "--"};
        command.insert(command.end(), names.begin(), names.end());
        auto const answer = recordsOf(repository.run(command)); // three records for each name
        for (std::size_t i = 0; i < names.size(); ++i) {
            EXPECT_EQ(isRefused(names[i]), answer.at(3 * i + 2) == "upper") << names[i] << " with" << done;
        }
    }

    std::vector<std::string> names{"a",   "b.up",  "a b",   "d/a",      "d/b.up",
                                   "d/A", "d/e/a", "d/e/b", "e/d/b.up", "\xc3\xa4.up"};
};

TEST_F(Attributes, ofEveryFormSetTheFilterDriver) {
    for (std::string const rules : {"* filter=upper",
                                    "*.up filter=upper",
                                    "a filter=upper",
                                    "/a filter=upper",
                                    "d/* filter=upper",
                                    "d/** filter=upper",
                                    "**/b.up filter=upper",
                                    "d/e filter=upper",
                                    "d/ filter=upper",
                                    "\"a b\" filter=upper",
                                    "*.up filter=upper\nb.up -filter",
                                    "*.up filter=upper\nb.up !filter",
                                    "*.up filter=upper\nb.up filter",
                                    "[attr]up filter=upper\n*.up up",
                                    "[attr]up filter=upper\n*.up up\nb.up -up",
                                    "*.up filter=other",
                                    "*.up filter=other filter=upper",
                                    "*.up text filter=upper -diff",
                                    "# * filter=upper",
                                    "  a\tfilter=upper",
                                    "[ab] filter=upper",
                                    "? filter=upper",
                                    "d/?/a filter=upper",
                                    "\xc3\xa4.up filter=upper",
                                    "\xef\xbb\xbf* filter=upper",
                                    "\"a\\040b\" filter=upper",
                                    "\"\\303\\244.up\" filter=upper",
                                    "\"\\141\" filter=upper",
                                    "\"\\1410\" filter=upper",
                                    "\"d\\/a\" filter=upper",
                                    "\"a b filter=upper",
                                    "\"a\"filter=upper",
                                    "!a filter=upper",
                                    "\"!a\" filter=upper",
                                    "[attr] filter=upper",
                                    "\"[attr]up\" filter=upper\n*.up up",
                                    "\"[attr] up x\" filter=upper\n*.up up",
                                    "\"\\14\" filter=upper",
                                    "\"\\148\" filter=upper",
                                    "\"\\441\" filter=upper",
                                    "\"\\",
                                    "\"\\14",
                                    "[attr]-up filter=upper\n*.up -up",
                                    "[attr]u/p filter=upper\n*.up u/p",
                                    "*.up te/xt filter=upper",
                                    "*.up filter=upper -",
                                    "*.up a_b.c-d filter=upper",
                                    "*.up -filter=upper",
                                    "*.up !filter=upper",
                                    "*.up =upper filter=upper",
                                    "*.up",
                                    "\t# x",
                                    "a filter=upper\r\n*.up text\r"}) {
        repository.write(".gitattributes", rules + "\n");
        expectAgreement("\n" + rules);
    }
}

TEST_F(Attributes, ofTheRepositorysOwnFileMayDefineMacros) {
    repository.write(".git/info/attributes", "[attr]up filter=upper\n");
    repository.write(".gitattributes", "*.up up\n");
    expectAgreement(" a macro in info/attributes");
    EXPECT_TRUE(isRefused("b.up"));
}

TEST_F(Attributes, ofAFolderBelowTheTopCannotDefineMacros) {
    repository.write("d/.gitattributes", "[attr]up filter=upper\n*.up up\n");
    expectAgreement(" a macro in d/.gitattributes");
    EXPECT_FALSE(isRefused("d/b.up"));
}

TEST_F(Attributes, inQuotesMayContainEveryCharacter) {
    for (auto const& [written, name] : std::map<std::string, std::string>{{"\\a", "\a"},
                                                                          {"\\b", "\b"},
                                                                          {"\\f", "\f"},
                                                                          {"\\n", "\n"},
                                                                          {"\\r", "\r"},
                                                                          {"\\t", "\t"},
                                                                          {"\\v", "\v"},
                                                                          {"\\\"", "\""},
                                                                          {"\\001", "\001"},
                                                                          {"\\177", "\177"},
                                                                          {"\\377", "\377"}}) {
        repository.write(".gitattributes", "\"x" + written + "y\" filter=upper\n");
        names = {"x" + name + "y", "x", "x" + written.substr(1) + "y"};
        for (auto const& file : names) {
            repository.write(file);
        }
        EXPECT_TRUE(isRefused(names[0])) << written;
        expectAgreement("\n" + written);
    }
}

TEST_F(Attributes, ofSeveralFilesHaveThePrecedenceThatGitGivesThem) {
    std::mt19937 random(3); // NOLINT: the same each time
    auto const pick = [&](auto const& values) { return std::string(values[random() % values.size()]); };
    std::array const patterns{"*",   "*.up", "a",      "/a", "d/*",   "e/*",
                              "b.*", "**/a", "d/e/**", "A",  "[a-b]", "up"};
    std::array const values{"filter=upper", "filter=other", "-filter", "!filter",
                            "filter",       "text",         "up",      "-up"};
    for (int i = 0; i < 60; ++i) {
        std::string done;
        for (std::string const file :
             {".gitattributes", "d/.gitattributes", "d/e/.gitattributes", ".git/info/attributes"}) {
            std::string rules = file == ".gitattributes" ? "[attr]up filter=upper\n" : "";
            for (auto count = random() % 3; count > 0; --count) {
                rules.append(pick(patterns)).append(" ").append(pick(values)).append("\n");
            }
            repository.write(file, rules);
            done.append("\n").append(file).append(":\n").append(rules);
        }
        expectAgreement(done);
    }
}

} // namespace
} // namespace project::git

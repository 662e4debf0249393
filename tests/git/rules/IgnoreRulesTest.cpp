#include <random>

#include "git/GitRepository.hpp"

namespace project::git {
namespace {

/// A work tree with files of many names. The adapter must agree with git on every set of rules.
class IgnoreRules : public GitTest {
protected:
    void SetUp() override {
        for (std::string const name :
             {"a",    "b",       "ab",    "a.b",   "A",     "a b",     "a ",       "#a",
              "!a",   "-",       "]",     "[a]",   "a*",    "a\\b",    "\xc3\xa4", "1",
              "d/a",  "d/ab",    "d/e/a", "d/e/b", "e/d/a", "e/d/e/a", "e/a",      "aa/aa/aa",
              "ba/a", "x/y/z/a", "a-b",   "a]",    "d/a b", "e/ab/b"}) {
            repository.write(name);
            names.push_back(name);
        }
    }

    void expectAgreementOn(std::string const& rules) {
        repository.write(".gitignore", rules);
        auto const expected = repository.statusStates();
        for (auto const& [name, state] : repository.adapterStates(adapter, names)) {
            EXPECT_EQ(state, expected.at(name)) << name << " with the rules\n" << rules;
        }
    }

    std::vector<std::string> names;
};

TEST_F(IgnoreRules, haveTheMeaningThatGitGivesThem) {
    for (std::string const rules : {"a",
                                    "/a",
                                    "d/a",
                                    "d/",
                                    "/d/",
                                    "e/d",
                                    "**/a",
                                    "d/**",
                                    "d/**/a",
                                    "**",
                                    "*",
                                    "**/",
                                    "a**",
                                    "**b",
                                    "e/**/a",
                                    "e/**a",
                                    "e/*/a",
                                    "?",
                                    "a?",
                                    "a?b",
                                    "[a-b]",
                                    "[!a]",
                                    "[^a]",
                                    "[]]",
                                    "[]-a]",
                                    "[[:digit:]]",
                                    "[[:alpha:]]b",
                                    "[[:nope:]]",
                                    "[a",
                                    "[",
                                    "\\[a\\]",
                                    "a\\*",
                                    "a\\\\b",
                                    "a\\",
                                    "\\#a",
                                    "#a",
                                    "\\!a",
                                    "!a",
                                    "a ",
                                    "a\\ ",
                                    "a\\  ",
                                    "a b",
                                    "a b  ",
                                    "\xc3\xa4",
                                    "\xc3?",
                                    "/",
                                    "//",
                                    "/*",
                                    "/*/",
                                    "/*/a",
                                    "*/a",
                                    "*/",
                                    "!",
                                    "d/e/",
                                    "e/d/e",
                                    "*b",
                                    "a*b",
                                    "[a-]",
                                    "[--0]",
                                    "[\\]]",
                                    "[[a]",
                                    "a[]b",
                                    "d/[a-b]",
                                    "d[/]a",
                                    "*\n!a",
                                    "/*\n!/d",
                                    "/*\n!/d/",
                                    "d\n!d/a",
                                    "d/*\n!d/a",
                                    "*\n!*/\n!a",
                                    "a\r\nb\r\n",
                                    "\xef\xbb\xbf\x61",
                                    "\n\n#x\na",
                                    "**/d/**",
                                    "**/**/a",
                                    "x/**/a",
                                    "x/**/**/a",
                                    "a/**",
                                    "***",
                                    "x/***/a",
                                    "d/a\n!a",
                                    "A",
                                    "[[:upper:]]",
                                    "[b-a]",
                                    "x/*/a",
                                    "x/*/*/a",
                                    "*/*/a",
                                    "aa/**",
                                    "[[:digit",
                                    "[[:digit]",
                                    "[[:]",
                                    "[[::]]",
                                    "[[a:]]",
                                    "[[:a]:]",
                                    "[a-",
                                    "[a-\\",
                                    "[\\",
                                    "[!",
                                    "[a-\\]]",
                                    "[[:space:]]",
                                    "a[[:space:]]b"}) {
        expectAgreementOn(rules);
    }
}

TEST_F(IgnoreRules, ignoreCaseIfConfigured) {
    repository.run({"config", "core.ignoreCase", "true"});
    for (std::string const rules :
         {"D/AB", "[B-C]", "[[:upper:]]", "[[:lower:]]", "*.B", "E/", "d/E/?", "\xc3\x84", "\xc3?"}) {
        repository.write(".gitignore", rules);
        auto const expected = repository.statusStates();
        for (std::string const name : {"b", "ab", "a.b", "d/ab", "d/e/b", "e/ab/b", "1", "\xc3\xa4"}) {
            EXPECT_EQ(stateOf(name), expected.at(name)) << name << " with the rules\n" << rules;
        }
    }
}

TEST_F(IgnoreRules, ofDeeperFilesPrecedeThoseAboveAndTheRepositorysOwn) {
    repository.write(".git/info/exclude", "a\nb\n");
    expectAgreementOn("!a\nab\n");
    repository.write("d/.gitignore", "!ab\na\n!/e/a\n");
    expectAgreementOn("!a\nab\n");
    repository.write("d/e/.gitignore", "!b\n");
    expectAgreementOn("ab\n");
    EXPECT_EQ(stateOf("d/e/b"), 0);
}

TEST_F(IgnoreRules, ofAConfiguredFileComeLast) {
    folder.addFile(u"excludes", "a\nb\n");
    repository.run({"config", "core.excludesFile", (folder.onDisk() / "excludes").string()});
    expectAgreementOn("!a\n");
    EXPECT_EQ(stateOf("a"), 0);
    EXPECT_EQ(stateOf("b"), 2);
}

TEST_F(IgnoreRules, ofAConfiguredFileMayBeReadThroughALink) {
    folder.addFile(u"excludes", "b\n");
    folder.addLink("link", "excludes");
    repository.run({"config", "core.excludesFile", (folder.onDisk() / "link").string()});
    expectAgreementOn("");
    EXPECT_EQ(stateOf("b"), 2);
}

TEST_F(IgnoreRules, ofALongFileAreReadToTheEnd) {
    std::string rules;
    while (rules.size() < 20'000) {
        rules += "# a comment\n";
    }
    expectAgreementOn(rules + "b\n");
    EXPECT_EQ(stateOf("b"), 2);
}

TEST_F(IgnoreRules, areNotReadThroughALink) {
    folder.addFile(u"rules", "*\n");
    folder.addLink("work/d/.gitignore", folder.onDisk() / "rules");
    expectAgreementOn("b\n");
    EXPECT_EQ(stateOf("d/ab"), 0);
}

TEST_F(IgnoreRules, ofRandomCharactersHaveTheMeaningThatGitGivesThem) {
    std::mt19937 random(7); // NOLINT: the same each time
    std::string const signs = "ab*?/[]!\\-d e*/a";
    for (int i = 0; i < 150; ++i) {
        std::string rules;
        for (auto length = 1 + random() % 12; length > 0; --length) {
            rules += random() % 12 == 0 ? '\n' : signs[random() % signs.size()];
        }
        expectAgreementOn(rules);
    }
}

TEST_F(IgnoreRules, withManyStarsAreFast) {
    repository.write(std::string(200, 'a'));
    std::string rules;
    for (int i = 0; i < 60; ++i) {
        rules += "a*";
    }
    repository.write(".gitignore", rules + "b\n");
    EXPECT_EQ(stateOf(std::string(200, 'a')), 0);
}

TEST_F(IgnoreRules, ofAMillionCharactersNeedLittleMemory) {
    repository.write("a");
    std::string rule;
    for (int i = 0; i < 400'000; ++i) {
        rule += "**/";
    }
    repository.write(".gitignore", rule + "a\n");
    EXPECT_EQ(stateOf("a"), 0);
}

} // namespace
} // namespace project::git

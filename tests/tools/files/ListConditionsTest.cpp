#include <functional>
#include <map>
#include <random>
#include <regex>
#include <set>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

/// A project with two categories, labelled files and an entry point.
class ListConditions : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        for (auto const* name : {u"src/io/pump.cpp", u"src/io/pump.hpp", u"src/main.cpp", u"readme.md"}) {
            folder_.file(name);
        }
        ASSERT_THAT(tool({"batch"}, "add -r .\n"
                                    "category create Status\nlabel create Status Open\n"
                                    "label create Status Done\ncategory create Owner\n"
                                    "label create Owner Ann\nlabel create Owner 'A=B'\n"
                                    "label put Status Open src/main.cpp src\n"
                                    "label put Status Done readme.md\nlabel put Owner Ann readme.md src\n"
                                    "label put Owner 'A=B' src/io\n"
                                    "entry set src/main.cpp\n"),
                    SucceedsSilently());
    }

    std::vector<std::string> list(std::vector<std::string> conditions) const {
        conditions.insert(conditions.begin(), "list");
        auto const result = tool(std::move(conditions));
        EXPECT_EQ(result.errors, "");
        return linesOf(result.output);
    }
};

using ::testing::ElementsAre;
using ::testing::IsEmpty;

TEST_F(ListConditions, selectByLabel) {
    EXPECT_THAT(list({"--label", "Status=Open"}), ElementsAre("src", "src/main.cpp"));
    EXPECT_THAT(list({"--label", "Owner"}), ElementsAre("readme.md", "src", "src/io"));
    EXPECT_THAT(list({"--label", "Owner=A=B"}), ElementsAre("src/io"));
    EXPECT_THAT(list({"--no-label", "Status"}), ElementsAre("src/io", "src/io/pump.cpp", "src/io/pump.hpp"));
    EXPECT_THAT(list({"--label", "Owner", "--no-label", "Owner=Ann"}), ElementsAre("src/io"));
    EXPECT_THAT(list({"--unlabelled"}), ElementsAre("src/io/pump.cpp", "src/io/pump.hpp"));
}

TEST_F(ListConditions, selectByKindNameAndEntryPoint) {
    EXPECT_THAT(list({"--kind", "folder"}), ElementsAre("src", "src/io"));
    EXPECT_THAT(list({"--kind", "file", "src"}),
                ElementsAre("src/io/pump.cpp", "src/io/pump.hpp", "src/main.cpp"));
    EXPECT_THAT(list({"--glob", "**/*.cpp"}), ElementsAre("src/io/pump.cpp", "src/main.cpp"));
    EXPECT_THAT(list({"--entry-points"}), ElementsAre("src/main.cpp"));
}

TEST_F(ListConditions, mustAllHold) {
    EXPECT_THAT(list({"--label", "Status", "--label", "Owner=Ann", "--kind", "file"}),
                ElementsAre("readme.md"));
    EXPECT_THAT(list({"--label", "Status=Open", "--label", "Status=Done"}), IsEmpty());
    EXPECT_THAT(list({"src", "--entry-points", "--glob", "*"}), IsEmpty());
}

TEST_F(ListConditions, applyToSeveralPathsInTheOrderOfTheProject) {
    EXPECT_THAT(list({"src/main.cpp", "readme.md", "src/io", "src/io/pump.cpp"}),
                ElementsAre("readme.md", "src/io", "src/io/pump.cpp", "src/io/pump.hpp", "src/main.cpp"));
}

TEST_F(ListConditions, theGlobIsComparedFromTheRootInEveryFolder) {
    EXPECT_THAT(toolFrom("src", {"list", "--glob", "src/*.cpp"}), Prints("main.cpp\n"));
}

TEST_F(ListConditions, aTreeShowsTheFoldersAboveTheFilesFound) {
    EXPECT_THAT(tool({"list", "--tree", "--glob", "**/*.cpp"}),
                Prints("src/\n  io/\n    pump.cpp\n  main.cpp\n"));
    EXPECT_THAT(tool({"list", "--tree", "--glob", "**/pump*", "src/io", "readme.md"}),
                Prints("src/io/\n  pump.cpp\n  pump.hpp\n"));
}

TEST_F(ListConditions, seeTheChangesOfTheirBatch) {
    EXPECT_THAT(tool({"batch"}, "remove src/io\nlabel take Owner Ann src\nlist --label Owner\n"
                                "list --kind folder\n"),
                Prints("readme.md\nsrc\n"));
}

TEST_F(ListConditions, refuseWhatIsNotInTheProjectOrNotAKind) {
    EXPECT_THAT(tool({"list", "--label", "Colour"}), FailsWith(1, "Colour"));
    EXPECT_THAT(tool({"list", "--label", "Status=Red"}), FailsWith(1, "has no label \"Red\""));
    EXPECT_THAT(tool({"list", "--no-label", "Colour=Red"}), FailsWith(1, "Colour"));
    EXPECT_THAT(tool({"list", "--kind", "link"}), FailsWith(2, "The kinds are file and folder"));
    EXPECT_THAT(tool({"list", "--label"}), FailsWith(2, "--label"));
}

/// A random project, and what is in it in plain containers.
class RandomListConditions : public ToolTest {
protected:
    struct File {
        bool isFolder;
        std::set<std::string> labels; ///< "CATEGORY=LABEL"
        bool isEntryPoint;
    };

    using Condition = std::function<bool(std::string const& path, File const&)>;

    void SetUp() override {
        initProject();
        std::string batch = "category create C0\ncategory create C1\n";
        for (auto const& label : labels_) {
            batch += "label create " + label.substr(0, 2) + ' ' + label.substr(3) + '\n';
        }
        for (int count = 0; count < 150; ++count) {
            addFile(batch);
        }
        ASSERT_THAT(tool({"batch"}, batch), SucceedsSilently());
    }

    std::size_t below(std::size_t limit) {
        return std::uniform_int_distribution<std::size_t>(0, limit - 1)(random_);
    }

    std::string name() { return oneOf({"a", "b", "ab", "[x]", "a b"}); }

    std::string oneOf(std::vector<std::string> const& things) { return things[below(things.size())]; }

    void addFile(std::string& batch) {
        std::string path;
        for (std::size_t depth = below(4); depth > 0; --depth) {
            path += name() + "/";
            files_.try_emplace(path.substr(0, path.size() - 1), File{true, {}, false});
        }
        path += "f" + name() + std::to_string(files_.size());
        folder_.addFile(path);
        auto& file = files_.emplace(path, File{false, {}, false}).first->second;
        batch += "add '" + path + "'\n";
        for (std::size_t count = below(3); count > 0; --count) {
            auto const label = oneOf(labels_);
            file.labels.insert(label);
            batch += "label put " + label.substr(0, 2) + ' ' + label.substr(3) + " '" + path + "'\n";
        }
        file.isEntryPoint = below(5) == 0;
        batch += file.isEntryPoint ? "entry set '" + path + "'\n" : std::string();
    }

    /// Adds one random condition to the command. @return what it means.
    Condition addCondition(std::vector<std::string>& command) {
        auto const label = oneOf(labels_);
        auto const category = label.substr(0, 3);
        auto const isOfCategory = [category](std::string const& one) { return one.starts_with(category); };
        auto const folder = oneOf({"folder", "file"});
        static std::vector<std::pair<std::string, std::string>> const globs{
            {"**/f*", "(?:.*/)?f[^/]*"},
            {"a/**", "a/.+"},
            {"*/*", "[^/]+/[^/]+"},
            {"**/a?/*", "(?:.*/)?a[^/]/[^/]+"},
            {"**/\\[x]/**", "(?:.*/)?\\[x\\]/.+"}};
        auto const& glob = globs[below(globs.size())];
        switch (below(7)) {
        case 0:
            command.insert(command.end(), {"--label", label});
            return [label](auto const&, File const& file) { return file.labels.contains(label); };
        case 1:
            command.insert(command.end(), {"--label", category.substr(0, 2)});
            return
                [=](auto const&, File const& file) { return std::ranges::any_of(file.labels, isOfCategory); };
        case 2:
            command.insert(command.end(), {"--no-label", label});
            return [label](auto const&, File const& file) { return !file.labels.contains(label); };
        case 3:
            command.insert(command.end(), {"--kind", folder});
            return [folder](auto const&, File const& file) { return file.isFolder == (folder == "folder"); };
        case 4:
            command.insert(command.end(), {"--glob", glob.first});
            return [glob](std::string const& path, File const&) {
                return std::regex_match(path, std::regex(glob.second));
            };
        case 5:
            command.emplace_back("--entry-points");
            return [](auto const&, File const& file) { return file.isEntryPoint; };
        default:
            command.emplace_back("--unlabelled");
            return [](auto const&, File const& file) { return file.labels.empty(); };
        }
    }

    /// The paths of `list --json`, which must be the files of the project, with their kinds.
    std::vector<std::string> listed() const {
        std::vector<std::string> result;
        auto const output = tool({"list", "--json"}).output;
        std::regex const row(R"re(\{"path": "([^"]*)", "kind": "(\w+)"\})re");
        for (std::sregex_iterator at(output.begin(), output.end(), row), end; at != end; ++at) {
            result.push_back((*at)[1]);
            EXPECT_EQ((*at)[2] == "folder", files_.at(result.back()).isFolder) << result.back();
        }
        EXPECT_EQ(result.size(), files_.size());
        return result;
    }

    std::mt19937 random_{11}; // NOLINT(cert-msc51-cpp): the same in every run
    std::vector<std::string> const labels_{"C0=A", "C0=B", "C1=A"};
    std::map<std::string, File> files_;
};

TEST_F(RandomListConditions, selectTheSameAsAFilterOverAllFiles) {
    auto const all = listed();
    std::size_t selected = 0;
    for (int round = 0; round < 120; ++round) {
        std::vector<std::string> command{"list"};
        std::vector<Condition> conditions;
        for (std::size_t count = 1 + below(3); count > 0; --count) {
            auto longer = command;
            auto condition = addCondition(longer);
            auto const& option = longer[command.size()];
            bool const canRepeat = option == "--label" || option == "--no-label";
            if (canRepeat || std::ranges::count(command, option) == 0) {
                command = std::move(longer);
                conditions.push_back(std::move(condition));
            }
        }
        std::vector<std::string> expected;
        std::ranges::copy_if(all, std::back_inserter(expected), [&](std::string const& path) {
            return std::ranges::all_of(conditions,
                                       [&](Condition const& holds) { return holds(path, files_.at(path)); });
        });
        selected += expected.size();
        ASSERT_EQ(linesOf(tool(command).output), expected) << ::testing::PrintToString(command);
    }
    EXPECT_GT(selected, 1000U);
}

} // namespace
} // namespace project::test

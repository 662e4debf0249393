#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

/// Projects in folders side by side, each named after its folder.
class ReferenceGraph : public ToolTest {
protected:
    void makeProject(std::string const& name) const { ASSERT_EQ(tool({"init", inFolder(name)}).exitCode, 0); }

    void makeReference(std::string const& from, std::string const& to) const {
        ASSERT_THAT(toolFrom(from, {"reference", "add", "../" + to}), SucceedsSilently());
    }

    void SetUp() override {
        for (auto const* name : {"engine", "pump", "valve", "seal"}) {
            std::filesystem::create_directory(inFolder(name));
            makeProject(name);
        }
    }

    std::string shown(std::string const& name) const { return name + " (" + inFolder(name) + ")"; }

    std::string quoted(std::string const& name) const { return '"' + inFolder(name) + '"'; }
};

TEST_F(ReferenceGraph, showsAProjectThatReferencesNothing) {
    EXPECT_THAT(toolFrom("engine", {"references", "--graph"}), Prints(shown("engine") + "\n"));
}

TEST_F(ReferenceGraph, followsReferencesAndShowsEachProjectsOwnOnce) {
    makeReference("engine", "pump");
    makeReference("engine", "valve");
    makeReference("pump", "seal");
    makeReference("valve", "pump");

    EXPECT_THAT(toolFrom("engine", {"references", "--graph"}),
                Prints(shown("engine") + "\n  ../pump: " + shown("pump") + "\n    ../seal: " + shown("seal") +
                       "\n  ../valve: " + shown("valve") + "\n    ../pump: " + shown("pump") +
                       ", see above\n"));
}

TEST_F(ReferenceGraph, findsTheProjectFromAnyFolderInIt) {
    makeReference("engine", "pump");
    folder_.file(u"engine/src/x");

    EXPECT_THAT(toolFrom("engine/src", {"references", "--graph"}).output,
                HasSubstr("../pump: " + shown("pump")));
}

TEST_F(ReferenceGraph, findsACycleOfProjects) {
    makeReference("engine", "pump");
    makeReference("pump", "seal");
    makeReference("seal", "pump");

    auto const tree = toolFrom("engine", {"references", "--graph"});

    EXPECT_EQ(tree.exitCode, 3);
    EXPECT_EQ(tree.output, shown("engine") + "\n  ../pump: " + shown("pump") + "\n    ../seal: " +
                               shown("seal") + "\n      ../pump: " + shown("pump") + ", a cycle\n");
    auto const json = toolFrom("engine", {"references", "--graph", "--json"});
    EXPECT_EQ(json.exitCode, 3);
    EXPECT_THAT(json.output,
                HasSubstr("\"cycles\": [\n[" + quoted("pump") + ", " + quoted("seal") + "]\n]}\n"));
}

TEST_F(ReferenceGraph, findsAProjectThatReferencesItself) {
    ASSERT_THAT(toolFrom("engine", {"reference", "add", "."}), SucceedsSilently());

    auto const tree = toolFrom("engine", {"references", "--graph"});

    EXPECT_EQ(tree.exitCode, 3);
    EXPECT_EQ(tree.output, shown("engine") + "\n  .: " + shown("engine") + ", a cycle\n");
}

TEST_F(ReferenceGraph, findsEachOfSeveralCycles) {
    makeReference("engine", "pump");
    makeReference("pump", "engine");
    makeReference("engine", "valve");
    makeReference("valve", "engine");

    EXPECT_THAT(toolFrom("engine", {"references", "--graph", "--json"}).output,
                HasSubstr("\"cycles\": [\n[" + quoted("engine") + ", " + quoted("pump") + "],\n[" +
                          quoted("engine") + ", " + quoted("valve") + "]\n]}\n"));
}

TEST_F(ReferenceGraph, showsMissingProjectsAndContinues) {
    makeReference("engine", "pump");
    makeReference("engine", "seal");
    makeReference("engine", "valve");
    folder_.remove(u"pump");
    folder_.remove(u"seal/.projectdata");

    auto const tree = toolFrom("engine", {"references", "--graph"});

    EXPECT_EQ(tree.exitCode, 3);
    EXPECT_EQ(tree.errors, "");
    EXPECT_EQ(tree.output, shown("engine") + "\n  ../pump: missing (" + inFolder("pump") +
                               ")\n  ../seal: no project (" + inFolder("seal") +
                               ")\n  ../valve: " + shown("valve") + "\n");
}

TEST_F(ReferenceGraph, showsAProjectThatCannotBeRead) {
    makeReference("engine", "pump");
    std::ofstream(inFolder("pump/.projectdata/project.jsonl"))
        << "{\"format\":\"project-definition\",\"version\":9}\n";

    auto const tree = toolFrom("engine", {"references", "--graph"});

    EXPECT_EQ(tree.exitCode, 3);
    EXPECT_THAT(tree.output, HasSubstr("  ../pump: unreadable (" + inFolder("pump") + "): "));
    EXPECT_THAT(toolFrom("engine", {"references", "--graph", "--json"}).output,
                HasSubstr("{\"folder\": " + quoted("pump") +
                          ", \"state\": \"unreadable\", \"name\": \"\", \"problem\": \""));
}

TEST_F(ReferenceGraph, writesJson) {
    makeReference("engine", "pump");

    EXPECT_THAT(
        toolFrom("engine", {"references", "--graph", "--json"}),
        Prints("{\"format\": \"projectctl-reference-graph\", \"version\": 1, \"projects\": [\n{\"folder\": " +
               quoted("engine") +
               ", \"state\": \"project\", \"name\": \"engine\"},\n{\"folder\": " + quoted("pump") +
               ", \"state\": \"project\", \"name\": \"pump\"}\n], \"references\": [\n{\"from\": " +
               quoted("engine") + ", \"to\": " + quoted("pump") +
               ", \"path\": \"../pump\", \"type\": \"Relative\", \"closesCycle\": false}\n], "
               "\"cycles\": []}\n"));
}

TEST_F(ReferenceGraph, writesTextForGraphviz) {
    ASSERT_THAT(toolFrom("pump", {"name", "the \"pump\" \\"}), SucceedsSilently());
    makeReference("engine", "pump");
    makeReference("pump", "engine");
    makeReference("pump", "seal");
    folder_.remove(u"seal");

    auto const dot = toolFrom("engine", {"references", "--graph", "--dot"});

    EXPECT_EQ(dot.exitCode, 3);
    EXPECT_EQ(dot.output, "digraph references {\n  " + quoted("engine") + " [label=\"engine\"];\n  " +
                              quoted("pump") + " [label=\"the \\\"pump\\\" \\\\\"];\n  " + quoted("seal") +
                              " [label=" + quoted("seal") + ", style=dashed, color=red];\n  " +
                              quoted("engine") + " -> " + quoted("pump") + ";\n  " + quoted("pump") + " -> " +
                              quoted("engine") + " [color=red];\n  " + quoted("pump") + " -> " +
                              quoted("seal") + ";\n}\n");
}

TEST_F(ReferenceGraph, followsAbsoluteReferencesAndLinksToOneProject) {
    std::filesystem::create_directory_symlink(inFolder("pump"), inFolder("link"));
    ASSERT_THAT(toolFrom("engine", {"reference", "add", "--absolute", "../link"}), SucceedsSilently());
    makeReference("engine", "pump");

    auto const tree = toolFrom("engine", {"references", "--graph"});

    EXPECT_THAT(tree, Prints(shown("engine") + "\n  " + inFolder("link") + ": " + shown("pump") +
                             "\n  ../pump: " + shown("pump") + "\n"));
}

TEST_F(ReferenceGraph, followsALongChain) {
    std::string const last = "p99";
    for (int number = 0; number < 100; ++number) {
        auto const name = "p" + std::to_string(number);
        std::filesystem::create_directory(inFolder(name));
        makeProject(name);
        if (number > 0) {
            makeReference("p" + std::to_string(number - 1), name);
        }
    }

    EXPECT_EQ(linesOf(toolFrom("p0", {"references", "--graph"}).output).size(), 100);
}

TEST_F(ReferenceGraph, requiresExactlyOneForm) {
    EXPECT_THAT(tool({"references"}), FailsWith(2, "--graph is required"));
    EXPECT_THAT(tool({"references", "--graph", "--json", "--dot"}), FailsInJsonWith(2, "excludes"));
}

} // namespace
} // namespace project::test

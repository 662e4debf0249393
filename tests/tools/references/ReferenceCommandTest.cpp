#include <regex>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

/// A project in the folder "engine", with other folders beside it.
class ReferenceCommand : public ToolTest {
protected:
    void SetUp() override {
        for (auto const* name : {u"engine/lib/x", u"engine/src/x", u"pump/x", u"valve/x"}) {
            folder_.file(name);
        }
        settings_.folder /= "engine";
        initProject();
    }

    std::filesystem::path textOfEngine() const {
        return folder_.onDisk() / "engine" / ".projectdata" / "project.jsonl";
    }

    std::string uuidOfFirst(std::string const& list) const {
        auto const output = tool({list, "list", "--json"}).output;
        std::smatch match;
        EXPECT_TRUE(std::regex_search(output, match, std::regex("\"uuid\": \"([^\"]*)\""))) << output;
        return match.empty() ? std::string() : match[1].str();
    }
};

TEST_F(ReferenceCommand, listsNothingInANewProject) {
    EXPECT_THAT(tool({"path", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"reference", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"reference", "list", "--json"}), Prints(document("reference-list", "references", {})));
}

TEST_F(ReferenceCommand, storesFoldersRelativeToTheRoot) {
    ASSERT_THAT(toolFrom("src", {"path", "add", "../lib", "."}), SucceedsSilently());
    ASSERT_THAT(tool({"path", "add", ".", "../pump"}), SucceedsSilently());

    EXPECT_THAT(tool({"path", "list"}), Prints(".\nlib\nsrc\n../pump\n"));
}

TEST_F(ReferenceCommand, storesTheAbsolutePathOnRequest) {
    ASSERT_THAT(tool({"reference", "add", "../pump"}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "../valve", "--absolute"}), SucceedsSilently());

    EXPECT_THAT(tool({"reference", "list"}), Prints("../pump\n" + inFolder("valve") + "\n"));
    EXPECT_THAT(tool({"reference", "list", "--json"}).output,
                HasSubstr("{\"path\": \"../pump\", \"type\": \"Relative\", \"folder\": \"" +
                          inFolder("pump") + "\", \"uuid\": \""));
    EXPECT_THAT(tool({"path", "add", "lib", "--absolute"}), FailsWith(2, "--absolute"));
}

TEST_F(ReferenceCommand, refusesAFolderThatIsAlreadyListed) {
    ASSERT_THAT(tool({"path", "add", "lib"}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "../pump"}), SucceedsSilently());

    EXPECT_THAT(tool({"path", "add", "src", "lib"}), FailsWith(1, "The folder \"" + inFolder("engine/lib") +
                                                                      "\" is on the project path already."));
    EXPECT_THAT(
        tool({"reference", "add", "../pump"}),
        FailsWith(1, "The project in the folder \"" + inFolder("pump") + "\" is referenced already."));
    EXPECT_THAT(tool({"path", "list"}), Prints("lib\n"));
    EXPECT_THAT(tool({"path", "add", "../pump"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, refusesPathsThatAreNotFolders) {
    EXPECT_THAT(tool({"path", "add", "lib", "lib/x"}), FailsWith(1, "/engine/lib/x\" is not a folder"));
    EXPECT_THAT(tool({"reference", "add", "../no"}), FailsWith(1, "/no\" is not a folder"));
    EXPECT_THAT(tool({"path", "list"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, removesAFolderByAnyPathToIt) {
    ASSERT_THAT(tool({"path", "add", "lib", "src", "../pump", "."}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "--absolute", "../valve"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("src", {"path", "remove", "../lib", inFolder("pump")}), SucceedsSilently());
    EXPECT_THAT(tool({"path", "list"}), Prints(".\nsrc\n"));
    EXPECT_THAT(tool({"reference", "remove", "../valve"}), SucceedsSilently());
    EXPECT_THAT(tool({"reference", "list"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, removesAFolderThatDoesNotExistAnyMore) {
    ASSERT_THAT(tool({"reference", "add", "../pump"}), SucceedsSilently());
    folder_.remove(u"pump");

    EXPECT_THAT(toolFrom("src", {"reference", "remove", "../../pump"}), SucceedsSilently());
    EXPECT_THAT(tool({"reference", "list"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, removesAFolderThatBecameALinkToItself) {
    ASSERT_THAT(tool({"path", "add", "lib"}), SucceedsSilently());
    folder_.remove(u"engine/lib");
    folder_.addLink("engine/lib", "lib");

    EXPECT_THAT(tool({"path", "remove", "lib"}), SucceedsSilently());
    EXPECT_THAT(tool({"path", "list"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, doesNotTakeAPathForOneRelativeToTheRoot) {
    folder_.file(u"engine/src/lib/x");
    ASSERT_THAT(tool({"path", "add", "lib", "src/lib"}), SucceedsSilently());

    ASSERT_THAT(toolFrom("src", {"path", "remove", "lib"}), SucceedsSilently());

    EXPECT_THAT(tool({"path", "list"}), Prints("lib\n"));
}

TEST_F(ReferenceCommand, removesOneEntryByItsUUID) {
    ASSERT_THAT(tool({"path", "add", "lib"}), SucceedsSilently());

    EXPECT_THAT(tool({"path", "remove", uuidOfFirst("path")}), SucceedsSilently());
    EXPECT_THAT(tool({"path", "list"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, removesNothingWhenOneIsNotListed) {
    ASSERT_THAT(tool({"path", "add", "lib"}), SucceedsSilently());

    EXPECT_THAT(tool({"path", "remove", "lib", "src"}),
                FailsWith(1, "\"src\" is not among the folders of the project path"));
    EXPECT_THAT(tool({"reference", "remove", "../pump"}),
                FailsWith(1, "\"../pump\" is not among the folders of the referenced projects"));
    EXPECT_THAT(tool({"path", "list"}), Prints("lib\n"));
}

TEST_F(ReferenceCommand, storesTheTargetOfALinkAndNotTheLink) {
    std::filesystem::create_directory_symlink(inFolder("pump"), inFolder("link"));
    ASSERT_THAT(tool({"reference", "add", "../link"}), SucceedsSilently());

    EXPECT_THAT(tool({"reference", "list"}), Prints("../pump\n"));
}

TEST_F(ReferenceCommand, refusesAFolderWhosePathHasABackslash) {
    std::filesystem::create_directory(inFolder("engine/back\\slash"));

    EXPECT_THAT(tool({"path", "add", "back\\slash"}),
                FailsWith(1, "because of the backslash in its path. Rename"));
    EXPECT_THAT(tool({"reference", "add", "back\\slash"}), FailsWith(1, "or add it with --absolute"));
    EXPECT_THAT(tool({"reference", "add", "back\\slash", "--absolute"}), SucceedsSilently());
    EXPECT_THAT(tool({"reference", "list"}), Prints(inFolder("engine/back\\slash") + "\n"));
}

TEST_F(ReferenceCommand, isNotedByStatusAndCheckWhenItCannotBeFollowed) {
    ASSERT_THAT(tool({"path", "add", "../valve"}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "../pump", "../valve"}), SucceedsSilently());
    folder_.remove(u"pump");

    auto const missing =
        "the reference \"../pump\" in the referenced projects cannot be followed: the folder \"" +
        inFolder("pump") + "\" does not exist\n";
    auto const empty =
        "the reference \"../valve\" in the referenced projects cannot be followed: the folder \"" +
        inFolder("valve") + "\" does not contain a project\n";
    auto const status = tool({"status"}).output;
    EXPECT_THAT(status, HasSubstr("note " + missing));
    EXPECT_THAT(status, HasSubstr("note " + empty));
    EXPECT_THAT(status, ::testing::Not(HasSubstr("project path"))); // it lists folders, not projects
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": note: " + missing));
    EXPECT_EQ(tool({"check"}).exitCode, 0);
}

TEST_F(ReferenceCommand, isNotedByStatusAndCheckWhenItsTypeIsNotSupported) {
    auto const uuid = std::string("01234567-89ab-4def-8123-456789abcdef");
    std::ifstream in(textOfEngine());
    std::string content{std::istreambuf_iterator<char>(in), {}};
    content.insert(content.rfind("{\"end\""), R"({"at":["ProjectPath","Root","Reference",")" + uuid +
                                                  R"("],"keys":{"Ref":"/x","Type":"Absolute"}})" + "\n");
    std::ofstream(textOfEngine()) << content;

    auto const text =
        "the reference \"" + uuid +
        "\" in the project path is not shown, because this list does not support its type \"Absolute\"\n";
    EXPECT_THAT(tool({"path", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"status"}).output, HasSubstr("note " + text));
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": note: " + text));
    EXPECT_THAT(tool({"path", "remove", uuid}), SucceedsSilently());
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(ReferenceCommand, resolvesAgainstTheNewRootWhenTheProjectHasMoved) {
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    ASSERT_THAT(tool({"path", "add", "lib"}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "../pump"}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "../valve", "--absolute"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "src/x"}), SucceedsSilently());
    auto const list = tool({"list"}).output;
    std::filesystem::create_directory(folder_.onDisk() / "elsewhere");
    std::filesystem::rename(folder_.onDisk() / "engine", folder_.onDisk() / "elsewhere" / "engine2");
    std::filesystem::rename(folder_.onDisk() / "pump", folder_.onDisk() / "elsewhere" / "pump");
    settings_.folder = folder_.onDisk() / "elsewhere" / "engine2";

    EXPECT_THAT(tool({"list"}), Prints(list));
    EXPECT_THAT(tool({"entry", "list"}), Prints("src/x: Basic, x\n"));
    EXPECT_THAT(tool({"path", "list", "--json"}).output,
                HasSubstr("\"folder\": \"" + inFolder("elsewhere/engine2/lib") + '"'));
    auto const references = tool({"reference", "list", "--json"}).output;
    EXPECT_THAT(references, HasSubstr("\"folder\": \"" + inFolder("elsewhere/pump") + '"'));
    EXPECT_THAT(references, HasSubstr("\"folder\": \"" + inFolder("valve") + '"'));
}

} // namespace
} // namespace project::test

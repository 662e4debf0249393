#include "tools/completion/CompletionTest.hpp"

namespace project::test {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsSupersetOf;
using ::testing::Not;
using ::testing::UnorderedElementsAre;

class CompleteCommand : public CompletionTest {
protected:
    /// The candidates for the last of some arguments, with their descriptions.
    Lines described(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(), {"__complete", "--"});
        auto const result = tool(arguments);
        EXPECT_EQ(result.exitCode, 0);
        EXPECT_EQ(result.errors, "");
        return partsOf(result.output);
    }

    Lines candidates(std::vector<std::string> arguments) const {
        return valuesOf(described(std::move(arguments)));
    }
};

TEST_F(CompleteCommand, offersCommandsAndTheMembersOfAGroup) {
    EXPECT_THAT(described({"li"}), ElementsAre("list\tList the files and folders of the project"));
    EXPECT_THAT(candidates({""}), IsSupersetOf({"add", "category", "list", "resolve"}));
    EXPECT_THAT(candidates({"category", ""}), ElementsAre("create", "list", "rename", "delete"));
}

TEST_F(CompleteCommand, hidesItself) {
    EXPECT_THAT(candidates({""}), Not(Contains("__complete")));
    EXPECT_THAT(candidates({"__c"}), ElementsAre());
    EXPECT_EQ(tool({"--help"}).output.find("__complete"), std::string::npos);
}

TEST_F(CompleteCommand, offersTheOptionsOfACommandAndThoseOfAllCommands) {
    EXPECT_THAT(candidates({"add", "--"}),
                IsSupersetOf({"--recursive", "--anew", "--dry-run", "--full-name"}));
    EXPECT_THAT(candidates({"add", "-"}), Contains("-C"));
    EXPECT_THAT(candidates({"add", "a", "--an"}), ElementsAre("--anew"));
    EXPECT_THAT(candidates({"add", "--", "--an"}), ElementsAre());
    EXPECT_THAT(candidates({"list", "--an"}), ElementsAre());
}

TEST_F(CompleteCommand, offersCategoriesAndTheLabelsOfThatCategory) {
    EXPECT_THAT(described({"label", "put", ""}), ElementsAre("My Cat\tcategory", "Status\tcategory"));
    EXPECT_THAT(described({"label", "put", "Status", ""}), ElementsAre("Open\tlabel", "Re \"viewed\tlabel"));
    EXPECT_THAT(candidates({"label", "put", "My Cat", ""}), ElementsAre("one\ntwo"));
    EXPECT_THAT(candidates({"label", "find", "--json", "Status", "O"}), ElementsAre("Open"));
    EXPECT_THAT(candidates({"label", "list", "S"}), ElementsAre("Status"));
    EXPECT_THAT(candidates({"list", "--label", ""}), ElementsAre("My Cat", "Status"));
    EXPECT_THAT(candidates({"list", "--label", "Status=O"}), ElementsAre("Status=Open"));
    EXPECT_THAT(candidates({"list", "--no-label=My Cat="}), ElementsAre("--no-label=My Cat=one\ntwo"));
}

TEST_F(CompleteCommand, offersPathsOfTheProjectOneLevelAtATime) {
    folder_.addFile("src/new.cpp");

    EXPECT_THAT(described({"list", ""}), ElementsAre("my dir/\tfolder", "quo\"te\tfile", "src/\tfolder"));
    EXPECT_THAT(described({"list", "src/"}), ElementsAre("src/a.cpp\tfile", "src/b.cpp\tfile"));
    EXPECT_THAT(candidates({"remove", "quo\"te", "my dir/l"}), ElementsAre("my dir/line\nbreak"));
    EXPECT_THAT(candidates({"label", "put", "Status", "Open", "src/a.cpp", "src/b"}),
                ElementsAre("src/b.cpp"));
    EXPECT_THAT(candidates({"list", inFolder("src/a")}), ElementsAre(inFolder("src/a.cpp")));
    EXPECT_THAT(candidates({"list", "src/a.cpp", "src/b"}), ElementsAre("src/b.cpp"));
    EXPECT_THAT(candidates({"entry", "set", "src/a.cpp", ""}), ElementsAre());
}

TEST_F(CompleteCommand, startsFromTheFolderOfTheOptionC) {
    EXPECT_THAT(candidates({"-C", "src", "list", ""}), ElementsAre("a.cpp", "b.cpp"));
    EXPECT_THAT(candidates({"list", "-C", "src", "../q"}), ElementsAre("../quo\"te"));
    EXPECT_THAT(candidates({"-C", "s"}), ElementsAre("src/"));
}

TEST_F(CompleteCommand, offersFilesThatCanBeAdded) {
    folder_.addFile("src/new.cpp");
    folder_.addFile("-new");

    EXPECT_THAT(candidates({"add", "src/"}), ElementsAre("src/new.cpp"));
    EXPECT_THAT(candidates({"add", ""}), ElementsAre("./-new", "my dir/", "src/"));
}

TEST_F(CompleteCommand, offersEntryPointsGroupsAndTypes) {
    ASSERT_THAT(tool({"entry", "set", "src/a.cpp", "--type", "Startup"}), SucceedsSilently());
    ASSERT_THAT(tool({"group", "create", "Two words"}), SucceedsSilently());

    EXPECT_THAT(described({"entry", "show", ""}), ElementsAre("src/a.cpp\tStartup"));
    EXPECT_THAT(candidates({"entry", "set", "src/b.cpp", "--group", ""}),
                ElementsAre("Default", "Two words"));
    EXPECT_THAT(candidates({"list", "--kind", "fo"}), ElementsAre("folder"));
    EXPECT_THAT(candidates({"entry", "set", "--type", "S"}), ElementsAre("Startup", "Shutdown"));
    EXPECT_THAT(candidates({"entry", "set", "--type=St"}), ElementsAre("--type=Startup"));
    EXPECT_THAT(candidates({"category", "create", "X", "--type", "L"}), ElementsAre("Logical"));
}

TEST_F(CompleteCommand, offersReferencesAndFolders) {
    ASSERT_THAT(tool({"path", "add", "my dir"}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "src"}), SucceedsSilently());

    EXPECT_THAT(candidates({"path", "remove", ""}), ElementsAre("my dir"));
    EXPECT_THAT(candidates({"reference", "remove", ""}), ElementsAre("src"));
    EXPECT_THAT(candidates({"reference", "add", ""}), ElementsAre("my dir/", "src/"));
}

TEST_F(CompleteCommand, offersTheUuidOfAThingWhoseNameDoesNotIdentifyIt) {
    createLabel("Other", "x");
    ASSERT_EQ(tool({"category", "rename", "Other", "Status"}).exitCode, 0);

    auto const found = candidates({"label", "put", ""});

    EXPECT_THAT(found, UnorderedElementsAre("My Cat", ::testing::SizeIs(36), ::testing::SizeIs(36)));
}

TEST_F(CompleteCommand, writesNothingOnErrors) {
    EXPECT_THAT(described({"no-such-command", ""}), ElementsAre());
    EXPECT_THAT(described({"list", "--no-such-option", ""}), ElementsAre());
    EXPECT_THAT(described({"label", "put", "NoSuchCategory", ""}), ElementsAre());
    EXPECT_THAT(described({"list", "/elsewhere/"}), ElementsAre());
    EXPECT_THAT(described({"-C", "no such folder", "list", ""}), ElementsAre());
    writeText("damaged");
    EXPECT_THAT(described({"label", "put", ""}), ElementsAre());
    std::filesystem::remove_all(text().parent_path());
    EXPECT_THAT(described({"list", ""}), ElementsAre());
    EXPECT_THAT(tool({"__complete", "--bash", "--", "projectctl li"}), SucceedsSilently());
    EXPECT_THAT(tool({"__complete", "--fish"}), SucceedsSilently());
}

TEST_F(CompleteCommand, changesNothing) {
    auto const before = readText();

    candidates({"add", ""});
    candidates({"label", "put", "Status", ""});

    EXPECT_EQ(readText(), before);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(text().parent_path()), {}), 3);
}

} // namespace
} // namespace project::test

#include "cli/Nearest.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::Not;

class UsageProblem : public ToolTest {};

TEST_F(UsageProblem, namesTheVerbThatWasProbablyMeant) {
    EXPECT_THAT(tool({"lsit"}), FailsWith(2, "unknown command or option \"lsit\". Did you mean \"list\"?"));
    EXPECT_THAT(tool({"lable", "list"}), FailsWith(2, "\"lable\". Did you mean \"label\"?"));
    EXPECT_THAT(tool({"label", "lst"}),
                FailsWith(2, "\"lst\". Did you mean \"list\"? ('projectctl label --help'"));
    EXPECT_THAT(tool({"put", "a"}), FailsWith(2, "\"put\". Did you mean \"label put\"?"));
    EXPECT_THAT(tool({"frobnicate"}), FailsWith(2, "unknown command or option \"frobnicate\" ("));
}

TEST_F(UsageProblem, namesTheOptionThatWasProbablyMeant) {
    EXPECT_THAT(tool({"list", "--tre"}), FailsWith(2, "unknown option \"--tre\". Did you mean \"--tree\"?"));
    EXPECT_THAT(tool({"list", "--jsn=1"}), FailsWith(2, "Did you mean \"--json\"?"));
    EXPECT_THAT(tool({"list", "--fullname"}), FailsWith(2, "Did you mean \"--full-name\"?"));
    EXPECT_THAT(tool({"list", "--zzzz"}), FailsWith(2, "unknown option \"--zzzz\" ("));
}

TEST_F(UsageProblem, abbreviationsAreNotVerbs) {
    initProject();
    EXPECT_THAT(tool({"desc"}), FailsWith(2, "\"desc\". Did you mean \"description\"?"));
    EXPECT_THAT(tool({"li"}), FailsWith(2, "\"li\". Did you mean \"list\"?"));
    EXPECT_THAT(tool({"list", "--tr"}), FailsWith(2, "\"--tr\". Did you mean \"--tree\"?"));
}

TEST_F(UsageProblem, isInGermanToo) {
    settings_.environment["LANG"] = "de";

    EXPECT_THAT(tool({"lsit"}),
                FailsWith(2, "unbekannter Befehl oder unbekannte Option „lsit“. Meinten Sie „list“?"));
    EXPECT_THAT(tool({"name", "a", "b"}),
                FailsWith(2, "überzähliges Argument „b“ („projectctl name --help“ zeigt"));
    EXPECT_THAT(tool({"list", "--tree", "--json"}), FailsInJsonWith(2, "--tree schließt --json aus"));
    EXPECT_THAT(tool({"remove"}), FailsWith(2, "PATH fehlt"));
    EXPECT_THAT(tool({"init", "--name"}), FailsWith(2, "--name braucht einen Wert"));
    EXPECT_THAT(tool({"add", "--gitignore", "."}), FailsWith(2, "--gitignore erfordert --recursive"));
    EXPECT_THAT(tool({}), FailsWith(2, "ein Befehl fehlt"));
}

/// The names of the project's things.
class MeantNames : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        std::filesystem::create_directories(inFolder("src/io"));
        folder_.addFile("src/io/pump.cpp");
        ASSERT_EQ(tool({"add", "src/io/pump.cpp"}).exitCode, 0);
        ASSERT_EQ(tool({"category", "create", "Status"}).exitCode, 0);
        ASSERT_EQ(tool({"label", "create", "Status", "Reviewed"}).exitCode, 0);
        ASSERT_EQ(tool({"group", "create", "Nightly"}).exitCode, 0);
    }
};

TEST_F(MeantNames, areNamedByTheErrors) {
    EXPECT_THAT(tool({"list", "src/io/pmp.cpp"}),
                FailsWith(1, "pmp.cpp\" is not in the project. Did you mean \"" +
                                 inFolder("src/io/pump.cpp") + "\"?"));
    EXPECT_THAT(tool({"label", "show", "scr/oi/pump.cpp"}),
                FailsWith(1, "Did you mean \"" + inFolder("src/io/pump.cpp") + "\"?"));
    EXPECT_THAT(tool({"list", "src/other"}),
                FailsWith(1, "is not in the project. Add it to the project first"));
    EXPECT_THAT(tool({"label", "list", "Statsu"}),
                FailsWith(1, "There is no category \"Statsu\" in the project. Did "
                             "you mean \"Status\"?"));
    EXPECT_THAT(tool({"label", "find", "Status", "reviewd"}), FailsWith(1, "Did you mean \"Reviewed\"?"));
    EXPECT_THAT(tool({"group", "delete", "Nigthly"}), FailsWith(1, "Did you mean \"Nightly\"?"));
}

TEST_F(MeantNames, ofTypesAreListed) {
    EXPECT_THAT(
        tool({"entry", "set", "src/io/pump.cpp", "--type", "Startp"}),
        FailsWith(1,
                  "\"Startp\" is not a type of entry point. Did you mean \"Startup\"? The types are Basic, "
                  "Startup, Shutdown and Batch_Job"));
    EXPECT_THAT(tool({"entry", "set", "src/io/pump.cpp", "--type", "X"}),
                FailsWith(1, "\"X\" is not a type of entry point. The types are Basic, Startup,"));
    EXPECT_THAT(tool({"entry", "set", "src/io/pump.cpp", "--type", "StartUp"}), SucceedsSilently());
}

TEST_F(MeantNames, areNamedInGermanToo) {
    settings_.environment["LANG"] = "de";
    EXPECT_THAT(tool({"list", "src/io/pmp.cpp"}),
                FailsWith(1, "Meinten Sie „" + inFolder("src/io/pump.cpp") + "“?"));
    EXPECT_THAT(tool({"label", "list", "Statsu"}), FailsWith(1, "Meinten Sie „Status“?"));
    EXPECT_THAT(tool({"label", "find", "Status", "x"}),
                FailsWith(1, "die Kategorie „Status“ hat kein Etikett „x“"));
    EXPECT_THAT(tool({"group", "delete", "x"}), FailsWith(1, "es gibt keine Einstiegspunktgruppe „x“"));
    EXPECT_THAT(tool({"entry", "set", "src/io/pump.cpp", "--type", "Startp"}),
                FailsWith(1, "Meinten Sie „Startup“?"));
}

using projectctl::nearest;

TEST(Nearest, findsTheNameWithTheFewestChanges) {
    std::vector<std::string> const names{"Startup", "Shutdown", "Basic"};

    EXPECT_EQ(nearest("Startp", names), "Startup");
    EXPECT_EQ(nearest("tSartup", names), "Startup");
    EXPECT_EQ(nearest("shutdown", names), "Shutdown");
    EXPECT_EQ(nearest("Bas", names), "Basic");
    EXPECT_EQ(nearest("Other", names), std::nullopt);
    EXPECT_EQ(nearest("", names), std::nullopt);
    EXPECT_EQ(nearest("x", {}), std::nullopt);
}

TEST(Nearest, countsCharactersInsteadOfBytes) {
    EXPECT_EQ(nearest("Prufung", {"Prüfung"}), "Prüfung");
}

TEST(Nearest, doesNotCompareVeryLongTexts) {
    EXPECT_EQ(nearest(std::string(100000, 'a'), {std::string(100000, 'b')}), std::nullopt);
}

} // namespace
} // namespace project::test

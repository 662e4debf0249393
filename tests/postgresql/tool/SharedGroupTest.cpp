#include "postgresql/tool/SharedToolTest.hpp"
#include "tools/json/GoldenDocument.hpp"

namespace project::test {
namespace {

using postgresql::sharedServer;
using ::testing::AllOf;
using ::testing::ContainsRegex;
using ::testing::HasSubstr;
using ::testing::Not;

/// The commands `projectctl shared`.
class SharedGroup : public SharedToolTest {
protected:
    void SetUp() override {
        SharedToolTest::SetUp();
        if (!IsSkipped()) {
            initShared();
            leadElsewhereTo("anna");
        }
    }

    std::string entries() const { return query("SELECT count(*) FROM pm.entry"); }

    void deleteNewestEntry() const { query("DELETE FROM pm.entry", " AND version = " + newestVersion()); }
};

TEST_F(SharedGroup, logShowsWhoWroteWhatAndWhen) {
    elsewhere({"name", "Pump"});

    auto const log = tool({"shared", "log"}).output;
    auto const withLines = tool({"shared", "log", "--lines", "--count", "1"}).output;

    EXPECT_THAT(log, ContainsRegex("^2\t20[0-9-]+ [0-9:]+ UTC\tanna\t[^\t]*\tbatch\n1\t20[0-9-]+ [0-9:]+ "
                                   "UTC\towner\t[^\t]*\tbody\n$"));
    EXPECT_THAT(withLines, AllOf(HasSubstr("2\t"), HasSubstr("\n    "), HasSubstr("Pump")));
    EXPECT_THAT(withLines, Not(HasSubstr("owner")));
}

TEST_F(SharedGroup, logShowsTheLinesOfTheFirstEntries) {
    elsewhere({"name", "Pump"});
    elsewhere({"name", "Valve"});

    auto const lines = tool({"shared", "log", "--lines"}).output;

    EXPECT_THAT(lines, AllOf(HasSubstr("Pump"), HasSubstr("Valve")));
}

TEST_F(SharedGroup, statusShowsTheNewestEntryAndTheSizes) {
    elsewhere({"name", "Pump"});

    auto const status = tool({"shared", "status"});

    EXPECT_EQ(status.exitCode, 0) << status.errors;
    EXPECT_THAT(status.output, AllOf(HasSubstr("store\towner, project " + id()), HasSubstr("version\t2\n"),
                                     HasSubstr("author\tanna\n"), ContainsRegex("body\t[1-9][0-9]* bytes\n"),
                                     ContainsRegex("tail\t[1-9][0-9]* bytes\n")));
}

TEST_F(SharedGroup, rolesShowsWhoHasAccess) {
    EXPECT_THAT(tool({"shared", "roles"}),
                Prints("reader\t" + reader_ + "\tanna\trita\nwriter\t" + writer_ + "\tanna\n"));
    EXPECT_EQ(elsewhere({"shared", "roles"}).exitCode, 0);
}

TEST_F(SharedGroup, writesTheJsonDocumentsOfItsVersions) {
    auto const host =
        sharedServer().query("SELECT host FROM pm.entry WHERE project = '" + id() + "' LIMIT 1");
    GoldenDocument const golden(
        {{reader_, "readers"}, {writer_, "writers"}, {"\"" + host + "\"", "\"host\""}});
    auto const expectGolden = [&](std::vector<std::string> command) {
        command.emplace_back("--json");
        auto const result = tool(command);
        EXPECT_EQ(result.errors, "") << ::testing::PrintToString(command);
        golden.expect(result.output);
    };
    elsewhere({"name", "Pump"});

    expectGolden({"shared", "status"});
    expectGolden({"shared", "roles"});
    expectGolden({"shared", "log"});
    EXPECT_THAT(tool({"shared", "log", "--lines", "--count", "1", "--json"}).output,
                AllOf(HasSubstr(R"("kind": "batch", "lines": [")"), HasSubstr("Pump")));
    query("UPDATE pm.entry SET at = at - interval '10 days'");
    expectGolden({"shared", "tidy", "--keep", "5"});
}

TEST_F(SharedGroup, statusInJsonSaysThatTheServerWasReset) {
    tool({"name", "Pump"});
    deleteNewestEntry();

    auto const status = tool({"shared", "status", "--json"});

    EXPECT_EQ(status.exitCode, 3);
    EXPECT_THAT(status.output, HasSubstr(R"("history": "reset", "seenVersion": 2)"));
    EXPECT_THAT(status.errors, HasSubstr("This is accepted from now on"));
}

TEST_F(SharedGroup, tidyDeletesOldHistoryForTheOwnerOnly) {
    for (auto const* name : {"Pump", "Valve", "Gate"}) {
        elsewhere({"name", name});
    }
    query("UPDATE pm.entry SET at = at - interval '10 days'");
    sharedServer().query("INSERT INTO pm.piece (project, id, number, bytes) VALUES ('" + id() +
                         "', gen_random_uuid(), 1, 'x')"); // an orphan

    EXPECT_THAT(elsewhere({"shared", "tidy", "--keep", "30"}), FailsWith(1, "the user may not do this"));
    EXPECT_EQ(entries(), "5") << "anna may append a body";
    EXPECT_THAT(tool({"shared", "tidy", "--keep", "30"}), Prints("deleted 0 entries\n"));
    EXPECT_EQ(entries(), "5");
    EXPECT_THAT(tool({"shared", "tidy", "--keep", "5"}), Prints("deleted 4 entries\n"));

    EXPECT_EQ(entries(), "1");
    EXPECT_EQ(query("SELECT count(DISTINCT id) FROM pm.piece"), "1") << "the orphan is deleted, too";
    EXPECT_THAT(elsewhere({"name"}), Prints("Gate\n"));
    EXPECT_EQ(elsewhere({"name", "Pump"}).exitCode, 0);
}

TEST_F(SharedGroup, historyThatIsYoungerThanTheLimitStays) {
    for (auto const* name : {"Pump", "Valve"}) {
        elsewhere({"name", name});
    }
    query("UPDATE pm.entry SET at = at - interval '10 days'", " AND version < 3");

    EXPECT_THAT(tool({"shared", "tidy", "--keep", "5"}), Prints("deleted 0 entries\n"))
        << "no body is old enough to begin with";

    EXPECT_EQ(entries(), "4");
}

TEST_F(SharedGroup, aResetOfTheServerIsReportedAndChangesAreRefusedUntilItIsAccepted) {
    tool({"name", "Pump"});
    deleteNewestEntry();

    auto const read = tool({"name"});
    EXPECT_EQ(read.output, "Engine\n");
    EXPECT_THAT(read.errors,
                HasSubstr("warning: the server was reset to an earlier state: version 2 was seen"));
    EXPECT_THAT(tool({"name", "Valve"}), FailsWith(1, "the server was reset to an earlier state"));
    EXPECT_THAT(tool({"name", "Valve"}), FailsWith(1, "the server was reset to an earlier state"));

    auto const status = tool({"shared", "status"});
    EXPECT_EQ(status.exitCode, 3);
    EXPECT_THAT(status.errors, HasSubstr("This is accepted from now on"));
    EXPECT_EQ(tool({"name", "Valve"}).exitCode, 0);
    EXPECT_THAT(tool({"name"}), Prints("Valve\n"));
}

TEST_F(SharedGroup, aProjectInATextHasNoLog) {
    std::filesystem::remove_all(elsewhere_.onDisk() / ".projectdata");
    ASSERT_EQ(elsewhere({"init"}).exitCode, 0);

    for (auto const* name : {"status", "tidy", "log", "roles"}) {
        EXPECT_THAT(elsewhere({"shared", name}), FailsWith(1, "the project is not shared"));
    }
}

} // namespace
} // namespace project::test

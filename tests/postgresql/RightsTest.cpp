#include <memory>
#include <string>

#include <gmock/gmock.h>
#include <libpq-fe.h>

#include "postgresql/SharedProjectFixture.hpp"

namespace project::postgresql {

namespace {

using std::chrono::seconds;
using ::testing::HasSubstr;

constexpr char const* refused = "42501"; // insufficient privilege

/// What users can do with any program, not only with ours.
class RightsTest : public SharedProjectTest {
protected:
    void SetUp() override {
        SharedProjectTest::SetUp();
        if (!IsSkipped()) {
            append(*anna, *body(1, "text\n"));
            append(*anna, *batch(2));
        }
    }

    /// Runs statements as a user. @return the code of their error; otherwise the number of changed or read
    /// rows.
    static std::string attempt(std::string const& user, std::string const& statements) {
        std::unique_ptr<PGconn, decltype(&PQfinish)> const handle(
            PQconnectdb(sharedServer().connection(user).c_str()), &PQfinish);
        std::unique_ptr<PGresult, decltype(&PQclear)> const result(PQexec(handle.get(), statements.c_str()),
                                                                   &PQclear);
        char const* const code = PQresultErrorField(result.get(), PG_DIAG_SQLSTATE);
        return code != nullptr ? code : PQcmdTuples(result.get());
    }

    /// An INSERT of version 3.
    std::string insert(std::string const& id, std::string const& extraColumn = "",
                       std::string const& value = "") const {
        return "INSERT INTO pm.entry (project, version, id, kind, after, sum, lines, pieces, host" +
               (extraColumn.empty() ? "" : ", " + extraColumn) + ") VALUES ('" + id +
               "', 3, gen_random_uuid(), 't', '', '', '', 0, ''" + (value.empty() ? "" : ", " + value) + ")";
    }

    std::string stored() const {
        return sharedServer().query("SELECT count(*) FROM pm.entry WHERE project = '" + project.id + "'");
    }

    std::string where() const { return " WHERE project = '" + project.id + "'"; }
};

} // namespace

TEST_F(RightsTest, aReaderReads) {
    auto const rita = open("rita");
    EXPECT_EQ(rita->look(std::nullopt).entries.size(), 2);
    EXPECT_EQ(rita->look(std::nullopt).body, "text\n");
    EXPECT_EQ(rita->records(std::nullopt, 10).size(), 2);
}

TEST_F(RightsTest, aReaderCannotWrite) {
    auto const rita = open("rita");
    rita->lock(seconds(5), std::nullopt);
    auto const error = errorOf([&] { rita->append(batch(3)->entry); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("the user may not do this"));
    EXPECT_EQ(attempt("rita", insert(project.id)), refused);
    EXPECT_EQ(attempt("rita", "UPDATE pm.barrier SET n = 7" + where()), refused);
    EXPECT_EQ(attempt("rita", "INSERT INTO pm.piece (project, id, number, bytes) VALUES ('" + project.id +
                                  "', gen_random_uuid(), 1, '')"),
              refused);
    EXPECT_EQ(stored(), "2");
}

TEST_F(RightsTest, aWriterCannotDeleteOrChangeEntries) {
    for (auto const* table : {"project", "entry", "piece", "barrier"}) {
        EXPECT_EQ(attempt("anna", "DELETE FROM pm." + std::string(table) + where()), refused) << table;
        EXPECT_EQ(attempt("anna", "TRUNCATE pm." + std::string(table)), refused) << table;
    }
    EXPECT_EQ(attempt("anna", "UPDATE pm.entry SET lines = ''" + where()), refused);
    EXPECT_EQ(attempt("anna", "UPDATE pm.piece SET bytes = ''" + where()), refused);
    EXPECT_EQ(attempt("anna", "UPDATE pm.project SET name = ''" + where()), refused);
    EXPECT_EQ(attempt("anna", "ALTER TABLE pm.entry DISABLE ROW LEVEL SECURITY"), refused);
    anna->lock(seconds(5), std::nullopt);
    EXPECT_EQ(errorOf([&] { anna->deleteBefore(1); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(stored(), "2");
}

TEST_F(RightsTest, aWriterCannotWriteAsAnotherUserOrAtAnotherTime) {
    EXPECT_EQ(attempt("anna", insert(project.id, "author", "'ben'")), refused);
    EXPECT_EQ(attempt("anna", insert(project.id, "author", "'anna'")), refused);
    EXPECT_EQ(attempt("anna", insert(project.id, "at", "'2001-01-01'")), refused);
    EXPECT_EQ(attempt("anna", "SET SESSION AUTHORIZATION ben"), refused);
    EXPECT_EQ(attempt("anna", "SET ROLE ben"), refused);
    EXPECT_EQ(attempt("anna", "SET ROLE \"" + project.writer + "\"; " + insert(project.id)), "1");
    EXPECT_EQ(anna->records(std::nullopt, 1)[0].author, "anna") << "not the name of the role";
}

TEST_F(RightsTest, aProjectIsNotVisibleToTheWritersOfAnother) {
    auto const other = createProject(sharedServer());
    sharedServer().query("REVOKE \"" + other.writer + "\" FROM anna, ben, swift; REVOKE \"" + other.reader +
                         "\" FROM rita; GRANT \"" + other.writer + "\" TO eve");
    auto const eve = open("eve");
    auto const error = errorOf([&] { eve->look(std::nullopt); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("the project is not on the server, or the user has no role of it"));
    for (auto const* table : {"project", "entry", "piece", "barrier"}) {
        EXPECT_EQ(attempt("eve", "SELECT FROM pm." + std::string(table) + where()), "0") << table;
        EXPECT_EQ(
            attempt("anna", "SELECT FROM pm." + std::string(table) + " WHERE project = '" + other.id + "'"),
            "0")
            << table;
    }
    EXPECT_EQ(attempt("eve", insert(project.id)), refused);
    EXPECT_EQ(attempt("eve", "INSERT INTO pm.piece (project, id, number, bytes) VALUES ('" + project.id +
                                 "', gen_random_uuid(), 1, '')"),
              refused);
    EXPECT_EQ(attempt("eve", "UPDATE pm.barrier SET n = 7" + where()), "0");
    EXPECT_EQ(attempt("eve", insert(other.id)), "1");
    auto const projects = SharedProjects(settingsFor(sharedServer().connection("eve"))).list();
    ASSERT_EQ(projects.size(), 1);
    EXPECT_EQ(projects[0].id, other.id);
    EXPECT_TRUE(projects[0].isWritable);
}

TEST_F(RightsTest, aUserWithoutAnyRoleSeesNothing) {
    sharedServer().query("CREATE ROLE nobody LOGIN PASSWORD 'secret'");
    auto const error = errorOf([&] { open("nobody")->look(std::nullopt); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("the user may not do this"));
    sharedServer().query("DROP ROLE nobody");
}

TEST_F(RightsTest, aDroppedRoleDoesNotStopTheUsersOfOtherProjects) {
    auto const other = createProject(sharedServer());
    sharedServer().query("DROP ROLE \"" + other.writer + "\"; DROP ROLE \"" + other.reader + "\"");
    EXPECT_EQ(append(*anna, *batch(3)), Journal::Appended::Stored);
    for (auto const& listed : SharedProjects(settingsFor(sharedServer().connection("anna"))).list()) {
        EXPECT_NE(listed.id, other.id);
    }
}

TEST_F(RightsTest, onlyTheOwnerCreatesAndDeletesProjects) {
    SharedProjects const asAnna(settingsFor(sharedServer().connection("anna")));
    SharedProject wanted{newId(), "mine", 0, project.reader, project.writer};
    EXPECT_EQ(errorOf([&] { asAnna.create(wanted); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(errorOf([&] { asAnna.remove(project.id); }).kind(), StoreError::Kind::Refused);
    SharedProjects const asOwner(settingsFor(sharedServer().connection("owner")));
    auto const error = errorOf([&] { asOwner.create(project); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("the project exists already"));
    EXPECT_FALSE(asOwner.remove(newId()));
}

TEST_F(RightsTest, aWriterIsNotTheOwner) {
    EXPECT_EQ(errorOf([&] { anna->requireOwner(); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(errorOf([&] { open("rita")->requireOwner(); }).kind(), StoreError::Kind::Refused);
    open("owner")->requireOwner();
}

TEST_F(RightsTest, anAdministratorCreatesAProjectWithPlainStatements) {
    auto const id = newId();
    EXPECT_EQ(attempt("owner", "CREATE ROLE meadow_reader NOLOGIN IN ROLE pm_reader;"
                               "CREATE ROLE meadow_writer NOLOGIN IN ROLE pm_writer, meadow_reader;"
                               "GRANT meadow_writer TO anna;"
                               "INSERT INTO pm.project (project, name, reader, writer) VALUES ('" +
                                   id + "', 'meadow', 'meadow_reader', 'meadow_writer');" +
                                   "INSERT INTO pm.barrier (project) VALUES ('" + id + "')"),
              "1");
    PostgresJournal journal(settingsFor(sharedServer().connection("anna")), id);
    auto const first = body(1, "text\n");
    EXPECT_EQ(append(journal, *first), Journal::Appended::Stored);
    EXPECT_EQ(append(journal, *first), Journal::Appended::Stored) << "passes the barrier";
    SharedProjects(settingsFor(sharedServer().connection("owner"))).remove(id);
}

TEST_F(RightsTest, anEntryThatIsNotWellFormedIsRefused) {
    std::string const tooLong(Journal::longestBatch + 1, 'x');
    anna->lock(seconds(5), std::nullopt);
    EXPECT_EQ(errorOf([&] { anna->append(batch(3, tooLong)->entry); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(anna->append(batch(3, tooLong.substr(1))->entry), Journal::Appended::Stored);
}

TEST_F(RightsTest, theListOfProjectsSaysWhatTheUserMayDo) {
    auto const find = [&](std::string const& user) {
        for (auto const& listed : SharedProjects(settingsFor(sharedServer().connection(user))).list()) {
            if (listed.id == project.id) {
                return listed;
            }
        }
        return SharedProject{};
    };
    EXPECT_EQ(find("anna").name, "garden");
    EXPECT_EQ(find("anna").format, 1);
    EXPECT_EQ(find("anna").reader, project.reader);
    EXPECT_EQ(find("anna").writer, project.writer);
    EXPECT_TRUE(find("anna").isWritable);
    EXPECT_EQ(find("rita").name, "garden");
    EXPECT_FALSE(find("rita").isWritable);
}

} // namespace project::postgresql

#include <fstream>
#include <future>
#include <string>

#include <arpa/inet.h>
#include <gmock/gmock.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include "postgresql/SharedProjectFixture.hpp"
#include "support/ChildProcess.hpp"
#include "support/EnvironmentVariable.hpp"
#include "support/GlobalLocale.hpp"

namespace project::postgresql {

namespace {

using std::chrono::seconds;
using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

/// What a user sees when a service does not work.
class ServiceTest : public SharedProjectTest {
protected:
    StoreError errorWith(std::string const& connection) const {
        auto settings = settingsFor(connection);
        settings.connectLimit = milliseconds(500);
        return errorOf([&] { PostgresJournal(settings, project.id).look(std::nullopt); });
    }
};

} // namespace

TEST_F(ServiceTest, aServiceFileAndAPasswordFileAreEnough) {
    test::TemporaryFolder const folder;
    auto const services =
        folder.addFile("services", "[garden]\nhost=127.0.0.1\nport=" + std::to_string(sharedServer().port()) +
                                       "\ndbname=projects\nuser=anna\nsslmode=disable\n");
    auto const passwords = folder.addFile("passwords", "*:*:projects:anna:secret\n");
    std::filesystem::permissions(passwords, std::filesystem::perms::owner_read);
    test::EnvironmentVariable const serviceFile("PGSERVICEFILE", services);
    test::EnvironmentVariable const passwordFile("PGPASSFILE", passwords);
    PostgresJournal journal(settingsFor("garden"), project.id);
    EXPECT_TRUE(journal.look(std::nullopt).entries.empty());
    EXPECT_EQ(journal.name(), "garden, project " + project.id);
    EXPECT_THAT(errorWith("meadow").what(),
                AllOf(HasSubstr("meadow: the service cannot be used"), HasSubstr("\"meadow\" not found")));
}

TEST_F(ServiceTest, aServiceThatDoesNotExistIsNamed) {
    auto const error = errorWith("no such service");
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), AllOf(HasSubstr("no such service: the service cannot be used"),
                                    HasSubstr("~/.pg_service.conf")));
}

TEST_F(ServiceTest, anErrorIsInTheLanguageOfTheProcess) {
    test::GlobalLocale const language("de_DE");

    EXPECT_THAT(errorWith("no such service").what(),
                AllOf(HasSubstr("no such service: der Dienst kann nicht benutzt werden: "),
                      HasSubstr("Tragen Sie den Dienst in die Dienstdatei von libpq ein")));
}

TEST_F(ServiceTest, anUnreadableConnectionStringIsRefused) {
    EXPECT_EQ(errorWith("host=localhost nonsense=1").kind(), StoreError::Kind::Refused);
}

TEST_F(ServiceTest, aWrongPasswordIsRefused) {
    auto const error = errorWith(sharedServer().connection("anna") + " password=wrong");
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), AllOf(HasSubstr("the server refused the user"),
                                    HasSubstr("password authentication failed for user"),
                                    Not(HasSubstr("28P01")), Not(HasSubstr("wrong")), Not(HasSubstr(".c:"))));
}

TEST_F(ServiceTest, aMissingPasswordIsRefused) {
    test::EnvironmentVariable const none("PGPASSFILE", "/nonexistent");
    auto const error = errorWith("host=127.0.0.1 sslmode=disable user=anna dbname=projects port=" +
                                 std::to_string(sharedServer().port()));
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("password"));
}

TEST_F(ServiceTest, aDatabaseThatDoesNotExistIsRefused) {
    auto const error = errorWith(sharedServer().connection("anna", "meadow"));
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), AllOf(HasSubstr("the database does not exist"), HasSubstr("\"meadow\"")));
}

TEST_F(ServiceTest, aDatabaseWithoutSharedProjectsIsRefused) {
    auto const error = errorWith(sharedServer().connection("anna", "postgres"));
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), AllOf(HasSubstr("does not contain shared projects"), HasSubstr("setup.sql")));
}

TEST_F(ServiceTest, aServerThatDoesNotRunIsUnreachable) {
    auto const error = errorWith(test::PostgresServer::connectionAt(test::freePort(), "anna"));
    EXPECT_EQ(error.kind(), StoreError::Kind::Unreachable);
    EXPECT_THAT(error.what(),
                AllOf(HasSubstr("the server cannot be reached"), HasSubstr("Connection refused")));
}

TEST_F(ServiceTest, aServerThatAcceptsAndNeverAnswersIsUnreachable) {
    int const silent = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    int const port = test::freePort();
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    ASSERT_EQ(::bind(silent, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
    ASSERT_EQ(::listen(silent, 4), 0);
    auto const error = errorWith(test::PostgresServer::connectionAt(port, "anna"));
    EXPECT_EQ(error.kind(), StoreError::Kind::Unreachable);
    EXPECT_THAT(error.what(), HasSubstr("no connection in the time"));
    ::close(silent);
}

TEST_F(ServiceTest, aConnectionWithoutEncryptionNeedsToBeAskedFor) {
    auto const error = errorWith("host=127.0.0.1 user=anna dbname=projects password=secret port=" +
                                 std::to_string(sharedServer().port()));
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("the connection is not secure"));
}

TEST_F(ServiceTest, aUnixSocketNeedsNoEncryption) {
    PostgresJournal journal(settingsFor("host=" + sharedServer().folder().string() +
                                        " port=" + std::to_string(sharedServer().port()) +
                                        " user=anna dbname=projects password=secret"),
                            project.id);
    EXPECT_TRUE(journal.look(std::nullopt).entries.empty());
}

TEST_F(ServiceTest, aProjectOfALaterFormatIsRefused) {
    sharedServer().query("UPDATE pm.project SET format = 2 WHERE project = '" + project.id + "'");
    auto const error = errorOf([&] { anna->look(std::nullopt); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(),
                AllOf(HasSubstr("the project has the format 2"), HasSubstr("Install a newer version")));
    EXPECT_EQ(errorOf([&] { anna->lock(seconds(5), 1); }).kind(), StoreError::Kind::Refused);
}

TEST_F(ServiceTest, aProjectThatIsDeletedMeanwhileIsReported) {
    append(*anna, *body(1, "text\n"));
    auto const own = batch(2);
    anna->lock(seconds(5), 1);
    EXPECT_TRUE(SharedProjects(settingsFor(sharedServer().connection("owner"))).remove(project.id));
    EXPECT_EQ(anna->append(own->entry), Journal::Appended::Superseded);
    anna->unlock();
    for (auto const seen : {std::optional<std::uint64_t>(), std::optional<std::uint64_t>(1)}) {
        auto const error = errorOf([&] { anna->look(seen); });
        EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
        EXPECT_THAT(error.what(), HasSubstr("the project is not on the server"));
    }
    EXPECT_EQ(errorOf([&] { anna->lock(seconds(5), 1); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(sharedServer().query("SELECT count(*) FROM pm.entry WHERE project = '" + project.id + "'"),
              "0");
}

TEST_F(ServiceTest, anIdentifierThatIsNotAUuidIsRefused) {
    for (auto const* id : {"", "garden", "D17D4E40-240C-4A7D-8A6F-AB6F58E53203",
                           "d17d4e40-240c-4a7d-8a6f-ab6f58e5320", "d17d4e40-240c-4a7d-8a6f_ab6f58e53203"}) {
        EXPECT_EQ(errorOf([&] { PostgresJournal(settingsFor("garden"), id); }).kind(),
                  StoreError::Kind::Refused)
            << id;
    }
}

TEST_F(ServiceTest, aForkedChildDoesNotTouchTheConnection) {
    append(*anna, *body(1, "text\n"));
    anna->lock(seconds(5), 1);
    anna->awaitChange(milliseconds(0));
    test::ChildProcess child([&](test::ChildProcess::Parent const& parent) {
        for (auto const& call : std::vector<std::function<void()>>{
                 [&] { anna->look(1); }, [&] { anna->append(batch(2)->entry); },
                 [&] { anna->lock(seconds(1), 1); }, [&] { anna->awaitChange(milliseconds(0)); },
                 [&] { anna->records(std::nullopt, 1); }}) {
            try {
                call();
                parent.say("the child used the connection");
            } catch (StoreError const& error) {
                parent.say(error.problem());
            }
        }
        anna->unlock();
        anna.reset();
        parent.say("closed");
    });
    for (int i = 0; i < 5; ++i) {
        EXPECT_EQ(child.hear(), "the connection belongs to the parent process");
    }
    EXPECT_EQ(child.hear(), "closed");
    ASSERT_TRUE(child.join());
    auto const ben = open("ben");
    EXPECT_EQ(errorOf([&] { ben->lock(milliseconds(50), 1); }).kind(), StoreError::Kind::Busy)
        << "anna has the lock";
    EXPECT_EQ(anna->append(batch(2)->entry), Journal::Appended::Stored);
    anna->unlock();
    EXPECT_EQ(anna->look(1).entries.size(), 2);
}

} // namespace project::postgresql

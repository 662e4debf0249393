#include <filesystem>
#include <fstream>
#include <thread>

#include <gmock/gmock.h>

#include "postgresql/SharedProjectFixture.hpp"
#include "project/session.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "support/EnvironmentVariable.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using postgresql::sharedServer;
using std::chrono::milliseconds;
using stores::StoreError;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// Two folders, as on two machines, and the services `engine` (its user may create projects) and `reading`.
class SharedSession : public ::testing::Test {
protected:
    void SetUp() override {
        if (auto const obstacle = test::PostgresServer::obstacle(); !obstacle.empty()) {
            GTEST_SKIP() << obstacle;
        }
        std::ofstream services(configuration_.onDisk() / "services");
        services << serviceSection("engine", "owner") << serviceSection("other", "rita");
    }

    static std::string serviceSection(std::string const& name, std::string const& user) {
        std::string lines = sharedServer().connection(user);
        std::ranges::replace(lines, ' ', '\n');
        return "[" + name + "]\n" + lines + "\n";
    }

    Session create(Options options = {}) const {
        auto const id = postgresql::newId();
        return Session::createShared(here_.root(), u"Engine", {"engine", "r_" + id, "w_" + id}, options);
    }

    /// Opens the project from the other folder, as after a checkout.
    Session openElsewhere() const {
        std::filesystem::create_directories(elsewhere_.onDisk() / ".projectdata");
        std::filesystem::copy_file(location(here_), location(elsewhere_));
        return Session::open(elsewhere_.root());
    }

    static std::filesystem::path location(test::TemporaryFolder const& folder) {
        return folder.onDisk() / ".projectdata" / "store.json";
    }

    test::TemporaryFolder const configuration_;
    test::EnvironmentVariable const serviceFile_{"PGSERVICEFILE", configuration_.onDisk() / "services"};
    test::TemporaryFolder const here_;
    test::TemporaryFolder const elsewhere_;
};

TEST_F(SharedSession, aProjectIsTheSameInEveryFolderThatLeadsToIt) {
    auto session = create();
    auto other = openElsewhere();

    other.project().setDescription(u"a pump");

    EXPECT_EQ(session.project().getName(), u"Engine");
    EXPECT_EQ(session.project().getDescription(), u"a pump");
    EXPECT_TRUE(session.isShared());
    EXPECT_FALSE(std::filesystem::exists(here_.onDisk() / ".projectdata" / "project.jsonl"));
}

TEST_F(SharedSession, filesOfTheProjectAreRelativeToEachFolder) {
    auto session = create();
    auto other = openElsewhere();
    session.project().getFileManager().add({here_.file(u"src/main.cpp")});

    EXPECT_TRUE(other.project().getFileManager().isFileInProject(elsewhere_.path(u"src/main.cpp")));
}

TEST_F(SharedSession, changesOfOthersRaiseEvents) {
    auto session = create();
    auto other = openElsewhere();
    session.refresh();
    int events = 0;
    session.events()->onNameChanged([&events] { ++events; });

    other.project().setName(u"Pump");

    EXPECT_TRUE(session.refresh());
    EXPECT_EQ(events, 1);
}

TEST_F(SharedSession, watchReportsAChangeAsSoonAsTheServerAnnouncesIt) {
    auto session = create();
    auto other = openElsewhere();
    session.refresh();
    session.watch(milliseconds(10)); // from now on the server announces changes
    std::thread writer([&other] {
        std::this_thread::sleep_for(milliseconds(100));
        other.project().setName(u"Pump");
    });

    EXPECT_TRUE(session.watch(std::chrono::seconds(20))); // less than the time between its own checks
    writer.join();
}

TEST_F(SharedSession, wakeEndsAWatch) {
    auto session = create();
    session.refresh();
    std::thread waker([&session] { session.wake(); });

    EXPECT_FALSE(session.watch(std::chrono::minutes(5)));
    waker.join();
}

TEST_F(SharedSession, aTransactionIsOneEntry) {
    auto session = create();
    auto const id =
        stores::readSharedLocation(*stores::makeSystemDisk(here_.root(), u".projectdata"))->project;
    auto const journal = stores::connectTo("postgresql", "engine")->open(id);
    auto const before = journal->records({}, 100).size();

    auto transaction = session.transaction();
    session.project().setName(u"Pump");
    session.project().setDescription(u"a pump");
    session.project().getFileManager().add({here_.file(u"a")});
    transaction.commit();

    EXPECT_EQ(journal->records({}, 100).size(), before + 1);
}

TEST_F(SharedSession, filesAreStagedAndSoIsTheLocation) {
    test::GitFolder const git(here_.onDisk());
    auto session = create();

    session.project().getFileManager().add({here_.file(u"a")});

    EXPECT_EQ(git.run({"ls-files"}), ".projectdata/.gitignore\n.projectdata/store.json\na\n");
}

TEST_F(SharedSession, theCacheIsIgnoredByGit) {
    test::GitFolder const git(here_.onDisk());
    create().project().setName(u"Pump");

    EXPECT_TRUE(std::filesystem::exists(here_.onDisk() / ".projectdata" / "cache"));
    EXPECT_THAT(git.run({"status", "--porcelain", "--untracked-files=all"}),
                ::testing::Not(HasSubstr("cache")));
}

TEST_F(SharedSession, nothingStaysBehindWhenTheServerRefusesANewProject) {
    auto const error = postgresql::errorOf([&] {
        Session::createShared(here_.root(), u"Engine", {"other", "r_refused", "w_refused"});
    });

    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_FALSE(std::filesystem::exists(location(here_)));
    EXPECT_THAT(postgresql::errorOf([&] { Session::open(here_.root()); }).what(),
                HasSubstr("there is no project in this folder"));
}

TEST_F(SharedSession, aFolderWithAProjectIsRefused) {
    Session::create(here_.root(), u"Text");

    auto const error = postgresql::errorOf([&] { create(); });

    EXPECT_THAT(error.what(), HasSubstr("contains a project already"));
    EXPECT_EQ(Session::open(here_.root()).project().getName(), u"Text");
}

TEST_F(SharedSession, aTextBesideTheLocationIsReported) {
    create();
    std::ofstream(here_.onDisk() / ".projectdata" / "project.jsonl") << "x";

    EXPECT_THAT(postgresql::errorOf([&] { Session::open(here_.root()); }).what(),
                HasSubstr("there is a text beside it"));
}

TEST_F(SharedSession, aResetOfTheServerIsReportedOnce) {
    auto session = create();
    session.project().setName(u"Pump");
    auto const id =
        stores::readSharedLocation(*stores::makeSystemDisk(here_.root(), u".projectdata"))->project;
    sharedServer().query("DELETE FROM pm.entry WHERE project = '" + id +
                         "' AND version = (SELECT max(version) FROM pm.entry WHERE project = '" + id + "')");

    session.refresh();
    EXPECT_THROW(session.project().setName(u"Valve"), StoreError);
    auto const loss = session.takeHistoryLoss();
    session.project().setName(u"Valve");

    ASSERT_TRUE(loss.has_value());
    EXPECT_EQ(loss->kind, stores::HistoryLoss::Kind::Reset);
    EXPECT_FALSE(session.takeHistoryLoss().has_value());
}

TEST(SharedServer, aKindWithoutALibrarySaysWhatToInstall) {
    auto const error = postgresql::errorOf([] { stores::connectTo("nosuchkind", "engine"); });

    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("libproject_nosuchkind.so"));
    EXPECT_THAT(error.remedy(), HasSubstr("Install the library for nosuchkind projects"));
}

TEST(SharedServer, aFileOfAProjectCannotNameAnAddressOrALibraryElsewhere) {
    for (auto const* service : {"host=example.org", "postgresql://example.org/x", "", "../x"}) {
        EXPECT_EQ(postgresql::errorOf([service] { stores::connectTo("postgresql", service); }).kind(),
                  StoreError::Kind::Refused);
    }
    for (auto const* kind : {"", "../evil", "Postgres", "a.b"}) {
        EXPECT_THAT(postgresql::errorOf([kind] { stores::connectTo(kind, "engine"); }).what(),
                    HasSubstr("is not a kind of server"));
    }
}

} // namespace
} // namespace project::session

#include <string>

#include "postgresql/SharedProjectFixture.hpp"
#include "project/stores/JournalBackend.hpp"
#include "support/RandomProcesses.hpp"
#include "support/Waiting.hpp"

namespace project::postgresql {

namespace {

using namespace std::chrono_literals;
using stores::JournalBackend;
using test::RandomProcesses;

/// Eight processes on one project of a real server.
class SharedStoreOrder : public ::testing::Test {
protected:
    void SetUp() override {
        if (auto const obstacle = test::PostgresServer::obstacle(); !obstacle.empty()) {
            GTEST_SKIP() << obstacle;
        }
        project = createProject(sharedServer());
    }

    /// Some processes write a body soon after the last one, some rarely.
    std::unique_ptr<stores::Backend> open(std::size_t lane, std::mt19937& random) const {
        auto const settings =
            settingsFor(sharedServer().connection("swift") + " application_name=" + nameOf(lane));
        JournalBackend::Options const options{.patience = 60s,
                                              .shortTail = random() % 3 > 0 ? 65'536U : 400U};
        return std::make_unique<JournalBackend>(std::make_unique<PostgresJournal>(settings, project.id),
                                                options);
    }

    /// The server may still apply what a process sent before its death.
    static void awaitEndOfSession(std::size_t lane) {
        auto const sessions =
            "SELECT count(*) FROM pg_stat_activity WHERE application_name = '" + nameOf(lane) + "'";
        EXPECT_TRUE(test::comesTrue([&] { return sharedServer().query(sessions) == "0"; }));
    }

    static std::string nameOf(std::size_t lane) { return "process" + std::to_string(lane); }

    SharedProject project;
    RandomProcesses processes{
        {.open = [this](std::size_t lane, std::mt19937& random) { return open(lane, random); },
         .tidy = [](stores::Backend& backend) { dynamic_cast<JournalBackend&>(backend).tidy(); },
         .awaitDeath = &awaitEndOfSession}};
};

} // namespace

TEST_F(SharedStoreOrder, ofEightProcessesIsOneForAll) {
    processes.runFor(2000ms, RandomProcesses::Deaths::None);
    EXPECT_GT(processes.operations(), 100U);
}

TEST_F(SharedStoreOrder, ofEightProcessesThatDieIsOneForAll) {
    processes.runFor(2000ms, RandomProcesses::Deaths::Some);
    EXPECT_GT(processes.operations(), 50U);
    EXPECT_GT(processes.deaths(), 0U);
}

} // namespace project::postgresql

#include "postgresql/FaultyProxy.hpp"
#include "postgresql/tool/SharedToolTest.hpp"
#include "support/Waiting.hpp"

namespace project::test {
namespace {

using postgresql::sharedServer;

/// Counts the requests of a command, each of which waits for an answer of the server.
class RoundTrips : public SharedToolTest {
protected:
    void SetUp() override {
        SharedToolTest::SetUp();
        if (IsSkipped()) {
            return;
        }
        initShared();
        sharedServer().query("GRANT \"" + writer_ + "\" TO swift");
        proxy_ = std::make_unique<FaultyProxy>(sharedServer().port());
        addService("counted", PostgresServer::connectionAt(proxy_->port(), "swift")); // needs no password
        leadElsewhereTo("counted");
        for (auto const* name : {"pump.cpp", "valve.cpp", "gate.cpp"}) {
            elsewhere_.addFile(name);
        }
    }

    int requestsOf(std::vector<std::string> const& command, std::string_view input = {}) const {
        int const before = proxy_->requests();
        auto const result = elsewhere(command, input);
        EXPECT_EQ(result.exitCode, 0) << result.errors;
        // The proxy may still be passing on the last request of a program that has ended.
        EXPECT_TRUE(comesTrue([this] { return proxy_->openConnections() == 0; }));
        return proxy_->requests() - before;
    }

    /// The greeting with the name of the user, and the settings of the session with its identity.
    static constexpr int connecting = 2;

    /// The check for changes.
    static constexpr int reading = 1;

    /// The lock with the check for changes, and the entry. The release of the lock is one more request, for
    /// whose answer nobody waits.
    static constexpr int writing = 2;
    static constexpr int releasing = 1;

    std::unique_ptr<FaultyProxy> proxy_;
};

TEST_F(RoundTrips, aCommandThatChangesTheProjectTakesTwo) {
    std::vector<std::vector<std::string>> const commands{
        {"add", "pump.cpp", "valve.cpp"},
        {"remove", "valve.cpp"},
        {"name", "Pump"},
        {"description", "a pump"},
        {"category", "create", "Status"},
        {"category", "rename", "Status", "State"},
        {"label", "create", "State", "Done"},
        {"label", "put", "State", "Done", "pump.cpp"},
        {"label", "take", "State", "Done", "pump.cpp"},
        {"label", "delete", "State", "Done"},
        {"category", "delete", "State"},
        {"entry", "set", "pump.cpp"},
        {"entry", "remove", "pump.cpp"},
        {"group", "create", "all"},
        {"group", "delete", "all"},
        {"path", "add", "."},
        {"path", "remove", "."},
        {"reference", "add", "."},
        {"reference", "remove", "."},
        {"tidy"},
    };
    for (auto const& command : commands) {
        EXPECT_EQ(requestsOf(command), connecting + writing + releasing)
            << command[0] << ' ' << command.back();
    }
    EXPECT_EQ(requestsOf({"batch"}, "add valve.cpp\nname Engine\ncategory create Status\n"),
              connecting + writing + releasing);
}

TEST_F(RoundTrips, aCommandThatReadsTheProjectTakesOne) {
    elsewhere({"batch"}, "add pump.cpp\ncategory create Status\nlabel create Status Done\n"
                         "label put Status Done pump.cpp\nentry set pump.cpp\n");
    std::vector<std::vector<std::string>> const commands{
        {"list"},
        {"list", "--json"},
        {"name"},
        {"description"},
        {"status"},
        {"category", "list"},
        {"label", "list", "Status"},
        {"label", "show", "pump.cpp"},
        {"label", "find", "Status", "Done"},
        {"entry", "list"},
        {"entry", "show", "pump.cpp"},
        {"group", "list"},
        {"path", "list"},
        {"reference", "list"},
        {"references", "--graph"},
        {"shared", "log"},
    };
    for (auto const& command : commands) {
        EXPECT_EQ(requestsOf(command), connecting + reading) << command[0] << ' ' << command.back();
    }
}

TEST_F(RoundTrips, aCommandWithoutACacheTakesOneToo) {
    std::filesystem::remove_all(elsewhere_.onDisk() / ".projectdata/cache");

    EXPECT_EQ(requestsOf({"list"}), connecting + reading);
}

TEST_F(RoundTrips, aCommandThatDoesNotNeedTheDefinitionTakesNone) {
    EXPECT_EQ(requestsOf({"root"}), 0);
}

} // namespace
} // namespace project::test

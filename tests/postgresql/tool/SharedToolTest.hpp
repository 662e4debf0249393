#pragma once

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "postgresql/SharedProjectFixture.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {

/// Runs projectctl on a shared project from two folders, as on two machines. A service has the name of its
/// user: owner, anna (who writes), rita (who reads).
class SharedToolTest : public ToolTest {
protected:
    void SetUp() override {
        if (auto const obstacle = PostgresServer::obstacle(); !obstacle.empty()) {
            GTEST_SKIP() << obstacle;
        }
        for (auto const* user : {"owner", "anna", "rita"}) {
            addService(user, postgresql::sharedServer().connection(user));
        }
        settings_.environment["PGSERVICEFILE"] = services();
    }

    std::filesystem::path services() const { return configuration_.onDisk() / "services"; }

    void addService(std::string const& name, std::string connection) const {
        std::ranges::replace(connection, ' ', '\n');
        std::ofstream(services(), std::ios::app) << "[" << name << "]\n" << connection << "\n";
    }

    /// Creates a shared project in the first folder, for all users.
    void initShared() {
        auto const result =
            tool({"init", "--name", "Engine", "--store", "owner", "--reader", reader_, "--writer", writer_});
        ASSERT_EQ(result.exitCode, 0) << result.errors;
        grant();
    }

    void grant() const {
        postgresql::sharedServer().query("GRANT \"" + writer_ + "\" TO anna; GRANT \"" + reader_ +
                                         "\" TO rita");
    }

    /// Lets the second folder lead to the same project with another service, as after a checkout.
    void leadElsewhereTo(std::string const& service) const {
        auto content = contentOf(location());
        auto const place = content.find("\"owner\"");
        ASSERT_NE(place, std::string::npos);
        content.replace(place, 7, '"' + service + '"');
        std::filesystem::create_directories(elsewhere_.onDisk() / ".projectdata");
        std::ofstream(elsewhere_.onDisk() / ".projectdata/store.json") << content;
    }

    /// Calls projectctl from the second folder.
    ProgramResult elsewhere(std::vector<std::string> arguments, std::string_view input = {}) const {
        auto settings = settings_;
        settings.folder = elsewhere_.onDisk();
        return runProgram(commandFor(std::move(arguments)), settings, input);
    }

    std::filesystem::path location() const { return folder_.onDisk() / ".projectdata/store.json"; }

    static std::string contentOf(std::filesystem::path const& file) {
        std::ifstream stream(file, std::ios::binary);
        return {std::istreambuf_iterator<char>(stream), {}};
    }

    /// The project's UUID.
    std::string id() const {
        auto const content = contentOf(location());
        auto const place = content.find("\"project\":\"");
        return place == std::string::npos ? "" : content.substr(place + 11, 36);
    }

    /// Runs a statement on the entries of the project as the superuser.
    /// @param statement its beginning, which the condition on the project follows.
    std::string query(std::string const& statement, std::string const& end = "") const {
        return postgresql::sharedServer().query(statement + " WHERE project = '" + id() + "'" + end);
    }

    std::string newestVersion() const { return query("SELECT max(version) FROM pm.entry"); }

    std::string const reader_ = "r_" + postgresql::newId();
    std::string const writer_ = "w_" + postgresql::newId();
    TemporaryFolder const configuration_;
    TemporaryFolder const elsewhere_;
};

} // namespace project::test

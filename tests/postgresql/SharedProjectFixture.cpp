#include "postgresql/SharedProjectFixture.hpp"

#include <cstdio>
#include <memory>
#include <stdexcept>

#include "project/metadata/MetadataFunctions.hpp"
#include "support/RunningProgram.hpp"

namespace project::postgresql {

namespace {

std::unique_ptr<test::PostgresServer> shared;

/// Stops the server before the program ends.
class ServerOfProgram : public ::testing::Environment {
public:
    void TearDown() override { shared.reset(); }
};

auto const* const environment = ::testing::AddGlobalTestEnvironment(new ServerOfProgram);

} // namespace

test::PostgresServer& sharedServer() {
    if (!shared) {
        shared = std::make_unique<test::PostgresServer>();
        prepare(*shared);
    }
    return *shared;
}

void prepare(test::PostgresServer& server) {
    server.query("CREATE ROLE owner LOGIN CREATEROLE PASSWORD 'secret'");
    server.query("GRANT CREATE ON DATABASE projects TO owner");
    for (auto const* user : {"anna", "ben", "swift", "rita", "eve"}) {
        server.query("CREATE ROLE " + std::string(user) + " LOGIN PASSWORD 'secret'");
    }
    // As the user of this program: the user of the server cannot read a repository in somebody's home folder.
    auto const setUp = test::runProgram({test::PostgresServer::program("psql"), "--no-psqlrc", "--quiet",
                                         "--set", "ON_ERROR_STOP=1", "--single-transaction", "--file",
                                         PROJECT_SETUP_SQL, server.connection("owner")},
                                        {});
    if (setUp.exitCode != 0) {
        throw std::runtime_error("setup.sql failed: " + setUp.errors);
    }
}

std::string newId() {
    std::string id;
    for (char16_t const unit : metadata::generateUUID()) {
        id += static_cast<char>(unit);
    }
    return id;
}

ServiceSettings settingsFor(std::string const& connection) {
    ServiceSettings settings;
    settings.service = connection;
    return settings;
}

SharedProject createProject(test::PostgresServer& server) {
    SharedProject project;
    project.id = newId();
    project.name = "garden";
    project.reader = "r_" + project.id;
    project.writer = "w_" + project.id;
    SharedProjects(settingsFor(server.connection("owner"))).create(project);
    server.query("GRANT \"" + project.writer + "\" TO anna, ben, swift; GRANT \"" + project.reader +
                 "\" TO rita");
    return project;
}

std::string sumOf(std::uint64_t version) {
    std::array<char, 33> text{};
    std::snprintf(text.data(), text.size(), "%032llx", static_cast<unsigned long long>(version));
    return version == 0 ? "" : text.data();
}

std::unique_ptr<OwnEntry> batch(std::uint64_t version, std::string const& lines) {
    auto own = std::make_unique<OwnEntry>();
    own->after = sumOf(version - 1);
    own->lines = lines;
    own->entry = {{version, newId(), sumOf(version)}, false, own->after, own->lines, ""};
    return own;
}

std::unique_ptr<OwnEntry> body(std::uint64_t version, std::string const& text, std::string const& lines) {
    auto own = batch(version, lines);
    own->body = text;
    own->entry.isBody = true;
    own->entry.body = own->body;
    return own;
}

void SharedProjectTest::SetUp() {
    if (auto const obstacle = test::PostgresServer::obstacle(); !obstacle.empty()) {
        GTEST_SKIP() << obstacle;
    }
    project = createProject(sharedServer());
    anna = open("anna");
}

Journal::Appended SharedProjectTest::append(Journal& journal, OwnEntry const& entry) {
    journal.lock(std::chrono::seconds(5), std::nullopt);
    auto const result = journal.append(entry.entry);
    journal.unlock();
    return result;
}

} // namespace project::postgresql

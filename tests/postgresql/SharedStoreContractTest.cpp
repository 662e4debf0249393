#include "support/MetadataManagerContract.hpp"

#include "postgresql/SharedProjectFixture.hpp"
#include "project/stores/JournalBackend.hpp"

namespace project::stores::contract {

namespace {

/// A client of the project that belongs to a root.
std::unique_ptr<Backend> makeSharedBackend(Path const& root) {
    static std::map<std::u16string, std::string> projects;
    auto& project = projects[root.native()];
    auto& server = postgresql::sharedServer();
    if (project.empty()) {
        project = postgresql::createProject(server).id;
    }
    auto const settings = postgresql::settingsFor(server.connection("swift"));
    return std::make_unique<JournalBackend>(std::make_unique<postgresql::PostgresJournal>(settings, project));
}

/// None where no server can be started: the other tests of this program say so.
std::vector<StoreKind> sharedStores() {
    std::vector<StoreKind> stores;
    if (test::PostgresServer::obstacle().empty()) {
        stores.push_back({"PostgreSQL", makeSharedBackend});
    }
    return stores;
}

} // namespace

INSTANTIATE_TEST_SUITE_P(SharedStore, MetadataManagerContract, testing::ValuesIn(sharedStores()),
                         [](auto const& kind) { return kind.param.name; });
GTEST_ALLOW_UNINSTANTIATED_PARAMETERIZED_TEST(MetadataManagerContract);

} // namespace project::stores::contract

#include "support/MetadataManagerContract.hpp"

#include "project/stores/JournalBackend.hpp"
#include "project/stores/MemoryBackend.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "support/MemoryJournal.hpp"

namespace project::stores::contract {
namespace {

/// A client of the server that has the project with this root.
std::unique_ptr<Backend> makeJournalBackend(Path const& root, JournalBackend::Options options) {
    static std::map<std::u16string, std::weak_ptr<test::JournalServer>> servers;
    auto server = servers[root.native()].lock();
    if (!server) {
        server = std::make_shared<test::JournalServer>();
        servers[root.native()] = server;
    }
    return std::make_unique<JournalBackend>(std::make_unique<test::MemoryJournal>(std::move(server)),
                                            options);
}

INSTANTIATE_TEST_SUITE_P(
    Stores, MetadataManagerContract,
    testing::Values(StoreKind{"memory", [](Path const&) { return std::make_unique<MemoryBackend>(); }},
                    StoreKind{"text",
                              [](Path const& root) {
                                  return std::make_unique<TextBackend>(
                                      makeSystemDisk(root, stores::TextBackend::folderName));
                              }},
                    StoreKind{"journal", [](Path const& root) { return makeJournalBackend(root, {}); }},
                    StoreKind{"journalOfBodies",
                              [](Path const& root) { return makeJournalBackend(root, {.shortTail = 0}); }}),
    [](auto const& kind) { return kind.param.name; });

} // namespace
} // namespace project::stores::contract

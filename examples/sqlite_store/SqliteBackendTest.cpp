// Runs the contract of every store over this one. It needs the library's source tree.
#include "SqliteBackend.hpp"

#include <fstream>

#include <sqlite3.h>

#include "NodeBytes.hpp"
#include "support/MetadataManagerContract.hpp"

namespace project::stores::contract {
namespace {

std::unique_ptr<Backend> makeBackend(Path const& root) {
    return std::make_unique<sqlite_store::SqliteBackend>(root / u".sqliteproject");
}

INSTANTIATE_TEST_SUITE_P(Sqlite, MetadataManagerContract, testing::Values(StoreKind{"sqlite", makeBackend}),
                         [](auto const& kind) { return kind.param.name; });

class SqliteBackendTest : public testing::Test {
protected:
    std::unique_ptr<TreeMetadataManager> open() const {
        return std::make_unique<TreeMetadataManager>(makeBackend(folder.root()),
                                                     folder.path(u".sqliteproject"));
    }

    static void set(TreeMetadataManager& store, MetadataPath const& address, std::u16string const& value) {
        auto const node = std::make_shared<MetadataNodeSpecification>(u"Info");
        node->put(u"Value", value);
        Nodes nodes{{address, node}};
        store.setNodes(nodes);
    }

    static std::u16string valueAt(TreeMetadataManager& store, MetadataPath const& address) {
        auto const node = store.getNode(address);
        return node ? node->get(u"Value") : u"(none)";
    }

    test::TemporaryFolder folder;
    MetadataPath const a = at({{u"Top", u"a"}});
    MetadataPath const ab = a.child({u"Mid", u"b"});
};

TEST_F(SqliteBackendTest, aDefinitionIsReadAgainAfterItsStoreWasClosed) {
    set(*open(), ab, u"1");
    EXPECT_EQ(valueAt(*open(), ab), u"1");
}

TEST_F(SqliteBackendTest, anAddressWithNothingLeftBelowItIsNotReadAgain) {
    set(*open(), ab, u"1");
    Paths paths{ab};
    open()->removeNodes(paths);
    EXPECT_FALSE(open()->pathExists(a));
}

TEST_F(SqliteBackendTest, aCreatedAddressIsReadAgainUntilItIsRemoved) {
    Paths paths{a, ab};
    open()->createPaths(paths);
    Paths below{ab};
    open()->removeNodes(below);
    EXPECT_TRUE(open()->pathExists(a));
    EXPECT_FALSE(open()->hasNode(a));
}

TEST_F(SqliteBackendTest, aCreatedAddressThatGetsANodeIsLoadedAsANodeOnly) {
    Paths paths{a};
    open()->createPaths(paths);
    set(*open(), a, u"1");
    auto const loaded = makeBackend(folder.root())->load(MetadataPath::root());
    ASSERT_EQ(loaded.size(), 1U);
    EXPECT_NE(loaded.front().node, nullptr);
    EXPECT_FALSE(loaded.front().isCreated);
    EXPECT_FALSE(loaded.front().hasChildren);
}

TEST_F(SqliteBackendTest, changesOfAnotherConnectionAreSeenByTheNextGuard) {
    auto const first = open();
    auto const second = open();
    set(*first, ab, u"1");
    EXPECT_EQ(valueAt(*second, ab), u"1");
    set(*second, ab, u"2");
    EXPECT_EQ(valueAt(*first, ab), u"2");
    Paths paths{a};
    first->removeNodes(paths);
    EXPECT_EQ(valueAt(*second, ab), u"(none)");
}

TEST_F(SqliteBackendTest, aReadGuardShowsOneStateWhileAnotherConnectionWrites) {
    auto const reader = open();
    auto const writer = open();
    set(*writer, ab, u"1");
    {
        auto const guard = reader->acquireReadLock();
        set(*writer, ab, u"2");
        EXPECT_EQ(valueAt(*reader, ab), u"1") << "not even if it is loaded after the write";
    }
    EXPECT_EQ(valueAt(*reader, ab), u"2");
}

TEST_F(SqliteBackendTest, aTransactionThatIsNotCommittedLeavesNothingBehind) {
    {
        auto const store = open();
        auto const transaction = store->transaction();
        set(*store, ab, u"1");
    }
    EXPECT_FALSE(open()->pathExists(a));
}

TEST_F(SqliteBackendTest, aWriterWaitsForTheGuardOfAnotherConnectionOverSeveralWrites) {
    auto const first = open();
    auto const second = open();
    std::thread other;
    {
        auto const guard = first->acquireWriteLock();
        set(*first, a, u"1");
        other = std::thread([&] { set(*second, a, u"other"); });
        set(*first, a, u"2");
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        EXPECT_EQ(valueAt(*first, a), u"2");
        EXPECT_EQ(valueAt(*open(), a), u"2") << "the other one has not written between the two";
    }
    other.join();
    EXPECT_EQ(valueAt(*first, a), u"other");
}

TEST_F(SqliteBackendTest, aFileThatIsNotADatabaseIsReportedAsDamaged) {
    folder.file(u".sqliteproject/project.sqlite", std::string(4096, 'x'));
    try {
        open();
        ADD_FAILURE() << "it was opened";
    } catch (StoreError const& error) {
        EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
        EXPECT_THAT(error.what(), testing::HasSubstr("project.sqlite"));
    }
}

TEST_F(SqliteBackendTest, aDatabaseOfANewerProgramIsRefused) {
    open();
    sqlite_store::Database(folder.path(u".sqliteproject/project.sqlite")).execute("PRAGMA user_version = 2");
    try {
        open();
        ADD_FAILURE() << "it was opened";
    } catch (StoreError const& error) {
        EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    }
}

TEST_F(SqliteBackendTest, aDamagedNodeIsReportedAndNotRead) {
    set(*open(), a, u"1");
    sqlite_store::Database(folder.path(u".sqliteproject/project.sqlite"))
        .execute("UPDATE addresses SET node = x'00000002' WHERE node IS NOT NULL");
    try {
        open()->getNode(a);
        ADD_FAILURE() << "it was read";
    } catch (StoreError const& error) {
        EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
    }
}

TEST(NodeBytes, everyCutOffNodeIsAnError) {
    MetadataNodeSpecification node(u"Info");
    node.put(u"Key", u"Value");
    node.addChild(u"Nested")->put(u"k", u"v");
    auto const bytes = sqlite_store::bytesOf(node);
    EXPECT_TRUE(isEqual(*sqlite_store::nodeOf(bytes), node));
    for (std::size_t size = 0; size < bytes.size(); ++size) {
        EXPECT_THROW(sqlite_store::nodeOf(bytes.substr(0, size)), sqlite_store::NodeBytesError) << size;
    }
    EXPECT_THROW(sqlite_store::nodeOf(bytes + "x"), sqlite_store::NodeBytesError);
}

} // namespace
} // namespace project::stores::contract

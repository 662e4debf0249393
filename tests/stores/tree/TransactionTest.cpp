#include "project/stores/Transaction.hpp"

#include <gmock/gmock.h>

#include <stdexcept>
#include <thread>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/MemoryBackend.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::stores {
namespace {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using testing::ElementsAre;
using testing::IsEmpty;
using Addresses = std::vector<Address>;

/// Records the calls that write, and fails on demand.
class RecordingBackend : public MemoryBackend {
public:
    Changes enter(Access access) override {
        calls.emplace_back(access == Access::Write ? "enter to write" : "enter to read");
        return MemoryBackend::enter(access);
    }

    void leave() noexcept override { calls.emplace_back("leave"); }

    FileChanges write(Batch const& batch) override {
        record("write " + std::to_string(batch.size()));
        written = batch;
        return files;
    }

    void keep() override { record("keep"); }

    void discard() noexcept override { calls.emplace_back("discard"); }

    std::vector<std::string> calls;
    std::string failing; ///< the call that fails
    Batch written;
    FileChanges files;

private:
    void record(std::string call) {
        calls.push_back(std::move(call));
        if (calls.back() == failing) {
            throw StoreError(StoreError::Kind::DiskFailed, "", 0, "no space is left", "");
        }
    }
};

class RecordingListener : public metadata::FileChangeRequestListener {
public:
    explicit RecordingListener(RecordingBackend& backend) : backend_(backend) {}

    void fileRemovalRequested(metadata::MetadataManager& /*store*/, Path const& /*metadataRoot*/,
                              std::vector<Path> const& files) override {
        notify("removed " + std::to_string(files.size()));
    }

    void fileAdditionRequested(metadata::MetadataManager& /*store*/,
                               std::vector<Path> const& files) override {
        notify("added " + std::to_string(files.size()));
    }

    bool acceptsFileChangeRequests() override { return true; }

    bool isRefusing = false;
    std::function<void()> act = [] {};

private:
    void notify(std::string notification) {
        backend_.calls.push_back(std::move(notification));
        act();
        if (isRefusing) {
            throw std::runtime_error("the index is locked");
        }
    }

    RecordingBackend& backend_;
};

class TransactionTest : public testing::Test {
protected:
    TransactionTest() { store.subscribe(listener); }

    static std::shared_ptr<MetadataNode> node(std::u16string const& value = u"") {
        auto result = std::make_shared<MetadataNodeSpecification>(u"Info");
        result->put(u"Value", value);
        return result;
    }

    void set(Address const& address, std::u16string const& value = u"") {
        std::map<Address, std::shared_ptr<MetadataNode>> nodes{{address, node(value)}};
        store.setNodes(nodes);
    }

    void remove(Address const& address) {
        Addresses addresses{address};
        store.removeNodes(addresses);
    }

    void create(Address const& address) {
        Addresses addresses{address};
        store.createPaths(addresses);
    }

    std::u16string valueAt(Address const& address) {
        auto const found = store.getNode(address);
        return found ? found->get(u"Value") : u"(none)";
    }

    /// Everything in the store, as a list of addresses.
    Addresses everything(Address const& from = Address::root()) {
        Addresses result;
        for (auto const& child : store.getChildNodes(from)) {
            result.push_back(child);
            auto const below = everything(child);
            result.insert(result.end(), below.begin(), below.end());
        }
        return result;
    }

    /// The calls since the last time, without the guards of queries.
    std::vector<std::string> calls() {
        auto result = std::exchange(backend->calls, {});
        std::erase_if(result, [](auto const& call) { return call == "enter to read" || call == "leave"; });
        return result;
    }

    Address const a = Address::root().child({u"Top", u"a"});
    Address const ab = a.child({u"Mid", u"b"});
    Address const abc = ab.child({u"Low", u"c"});
    Address const z = Address::root().child({u"Top", u"z"});
    RecordingBackend* backend = new RecordingBackend;
    TreeMetadataManager store{std::unique_ptr<Backend>(backend), u"/project/.projectdata"};
    std::shared_ptr<RecordingListener> listener = std::make_shared<RecordingListener>(*backend);
};

TEST_F(TransactionTest, commitWritesEverythingAsOneBatchAndNotifiesOnce) {
    auto transaction = store.transaction();
    set(a);
    set(abc);
    remove(a);
    create(z);
    EXPECT_THAT(calls(), ElementsAre("enter to write"));
    transaction.commit();
    EXPECT_THAT(calls(), ElementsAre("write 4", "removed 0", "added 0", "keep"));
    EXPECT_THAT(everything(), ElementsAre(z));
}

TEST_F(TransactionTest, theBatchHasTheChangesInTheOrderOfTheWrites) {
    auto transaction = store.transaction();
    set(z, u"1");
    set(a);
    set(z, u"2");
    transaction.commit();
    Addresses order;
    for (auto const& change : backend->written) {
        order.push_back(change.address);
    }
    EXPECT_THAT(order, ElementsAre(z, a, z));
    EXPECT_EQ(u"2", backend->written.back().node->get(u"Value"));
}

TEST_F(TransactionTest, onlyAdditionsAreNotifiedIfNothingWasRemoved) {
    auto transaction = store.transaction();
    set(a);
    set(z);
    transaction.commit();
    EXPECT_THAT(calls(), ElementsAre("enter to write", "write 2", "added 0", "keep"));
}

TEST_F(TransactionTest, writesWithoutEffectAreNotifiedAndNotWritten) {
    set(a);
    calls();
    auto transaction = store.transaction();
    set(a);
    remove(z);
    transaction.commit();
    EXPECT_THAT(calls(), ElementsAre("enter to write", "removed 0", "added 0"));
}

TEST_F(TransactionTest, aTransactionWithoutWritesNotifiesNobody) {
    store.transaction().commit();
    EXPECT_THAT(calls(), ElementsAre("enter to write"));
}

TEST_F(TransactionTest, theFilesOfTheBackendAreReportedOnce) {
    backend->files = {{u"/project/new", u"/project/other"}, {u"/project/old"}};
    auto transaction = store.transaction();
    set(a);
    create(z);
    transaction.commit();
    EXPECT_THAT(calls(), ElementsAre("enter to write", "write 2", "added 2", "removed 1", "keep"));
}

TEST_F(TransactionTest, laterOperationsSeeTheEffectsOfEarlierOnes) {
    set(ab, u"old");
    auto transaction = store.transaction();
    set(ab, u"new");
    EXPECT_EQ(u"new", valueAt(ab));
    remove(ab);
    EXPECT_FALSE(store.pathExists(a));
    set(abc);
    EXPECT_THAT(store.getChildNodes(a), ElementsAre(ab));
    EXPECT_FALSE(store.hasNode(ab));
}

TEST_F(TransactionTest, leavingTheScopeWithoutCommitRollsEverythingBack) {
    set(ab, u"old");
    create(z);
    auto const before = everything();
    calls();
    {
        auto const transaction = store.transaction();
        set(ab, u"new");
        remove(a);
        set(abc, u"deep");
        remove(z);
        create(a.child({u"New", u"n"}));
    }
    EXPECT_THAT(calls(), ElementsAre("enter to write"));
    EXPECT_EQ(before, everything());
    EXPECT_EQ(u"old", valueAt(ab));
    set(z, u"next"); // nothing of the transaction is written with a later write
    EXPECT_EQ(1U, backend->written.size());
}

TEST_F(TransactionTest, anOperationThatThrowsIsRolledBackAloneAndTheTransactionContinues) {
    auto transaction = store.transaction();
    set(a, u"1");
    std::map<Address, std::shared_ptr<MetadataNode>> nodes{{a, node(u"2")}, {z, nullptr}};
    EXPECT_THROW(store.setNodes(nodes), std::invalid_argument);
    set(ab);
    transaction.commit();
    EXPECT_EQ(u"1", valueAt(a));
    EXPECT_THAT(everything(), ElementsAre(a, ab));
}

TEST_F(TransactionTest, aNestedTransactionJoinsTheOuterOne) {
    auto outer = store.transaction();
    set(a);
    auto inner = store.transaction();
    set(ab);
    inner.commit();
    EXPECT_THAT(calls(), ElementsAre("enter to write"));
    outer.commit();
    EXPECT_THAT(calls(), ElementsAre("write 2", "added 0", "keep"));
}

TEST_F(TransactionTest, anInnerOneWithoutCommitIsRolledBackAlone) {
    auto outer = store.transaction();
    set(a, u"outer");
    {
        auto const inner = store.transaction();
        set(a, u"inner");
        remove(a);
        auto innermost = store.transaction();
        set(z);
        innermost.commit();
    }
    EXPECT_EQ(u"outer", valueAt(a));
    EXPECT_FALSE(store.pathExists(z));
    outer.commit();
    EXPECT_THAT(calls(), ElementsAre("enter to write", "write 1", "added 0", "keep"));
}

TEST_F(TransactionTest, anInnerOneThatWasCommittedIsRolledBackWithTheOuterOne) {
    {
        auto const outer = store.transaction();
        auto inner = store.transaction();
        set(a);
        inner.commit();
    }
    EXPECT_THAT(everything(), IsEmpty());
}

TEST_F(TransactionTest, anOuterOneCannotBeCommittedBeforeAnInnerOne) {
    auto outer = store.transaction();
    set(a);
    {
        auto inner = store.transaction();
        EXPECT_THROW(outer.commit(), std::logic_error);
        inner.commit();
    }
    outer.commit();
    EXPECT_THAT(everything(), ElementsAre(a));
}

TEST_F(TransactionTest, aTransactionCannotBeCommittedTwice) {
    auto transaction = store.transaction();
    transaction.commit();
    EXPECT_THROW(transaction.commit(), std::logic_error);
}

TEST_F(TransactionTest, anInnerOneEndsWithItsOuterOneThatIsRolledBack) {
    auto outer = std::make_unique<Transaction>(store.transaction());
    auto inner = store.transaction();
    set(a);
    outer.reset();
    EXPECT_FALSE(store.pathExists(a));
    EXPECT_THROW(inner.commit(), std::logic_error);
}

TEST_F(TransactionTest, anotherThreadCannotCommitIt) {
    auto transaction = store.transaction();
    set(a);
    std::thread([&] { EXPECT_THROW(transaction.commit(), std::logic_error); }).join();
    transaction.commit();
    EXPECT_THAT(everything(), ElementsAre(a));
}

TEST_F(TransactionTest, anotherThreadWaitsUntilItHasEnded) {
    auto transaction = store.transaction();
    set(a, u"1");
    std::u16string seen;
    std::thread reader([&] { seen = valueAt(a); });
    set(a, u"2");
    transaction.commit();
    reader.join();
    EXPECT_EQ(u"2", seen);
}

TEST_F(TransactionTest, oneThatWasMovedFromDoesNothing) {
    auto first = store.transaction();
    set(a);
    {
        auto second = std::move(first);
        second.commit();
    }
    EXPECT_THROW(first.commit(), std::logic_error); // NOLINT(bugprone-use-after-move): that is the question
    EXPECT_THAT(everything(), ElementsAre(a));
}

TEST_F(TransactionTest, aCommitThatFailsLeavesTheProjectAsBefore) {
    set(a, u"old");
    for (auto const* const failing : {"write 2", "keep"}) {
        SCOPED_TRACE(failing);
        backend->failing = failing;
        calls();
        auto transaction = store.transaction();
        set(a, u"new");
        set(z);
        EXPECT_THROW(transaction.commit(), StoreError);
        EXPECT_EQ("discard", calls().back());
        EXPECT_EQ(u"old", valueAt(a));
        EXPECT_THAT(everything(), ElementsAre(a));
        backend->failing.clear();
        store.transaction().commit(); // nothing of the failed one is left, and the guard is released
        EXPECT_THAT(calls(), ElementsAre("enter to write"));
    }
}

TEST_F(TransactionTest, aListenerThatThrowsRollsItBack) {
    listener->isRefusing = true;
    auto transaction = store.transaction();
    set(a);
    EXPECT_THROW(transaction.commit(), std::runtime_error);
    EXPECT_THAT(calls(), ElementsAre("enter to write", "write 1", "added 0", "discard"));
    EXPECT_THAT(everything(), IsEmpty());
}

TEST_F(TransactionTest, aListenerSeesTheWholeAndCannotBeginOne) {
    StoreError::Kind refused{};
    Addresses seen;
    listener->act = [&] {
        seen = everything();
        try {
            store.transaction();
        } catch (StoreError const& error) {
            refused = error.kind();
        }
    };
    auto transaction = store.transaction();
    set(ab);
    set(z);
    transaction.commit();
    EXPECT_THAT(seen, ElementsAre(a, ab, z));
    EXPECT_EQ(StoreError::Kind::Refused, refused);
}

TEST_F(TransactionTest, aThreadThatOnlyReadsCannotBeginOne) {
    auto const guard = store.acquireReadLock();
    EXPECT_THROW(store.transaction(), std::system_error);
}

} // namespace
} // namespace project::stores

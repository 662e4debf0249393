#pragma once

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include <gmock/gmock.h>

#include "platform/LockTestThreads.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

// The contract of every store: one suite that runs over each of them. A test program includes it in one
// source and instantiates it for its stores.

namespace project::stores::contract {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::PathElement;
using testing::ElementsAre;
using testing::IsEmpty;
using Nodes = std::map<MetadataPath, std::shared_ptr<MetadataNode>>;
using Paths = std::vector<MetadataPath>;

struct StoreKind {
    std::string name; ///< "memory" if each backend has a definition of its own
    std::function<std::unique_ptr<Backend>(Path const& root)> makeBackend; ///< of the project with this root
};

inline MetadataPath at(std::vector<PathElement> elements) {
    return MetadataPath(std::move(elements));
}

class MetadataManagerContract : public testing::TestWithParam<StoreKind> {
protected:
    static std::shared_ptr<MetadataNode> node(std::u16string const& value = u"") {
        auto made = std::make_shared<MetadataNodeSpecification>(u"Info");
        if (!value.empty()) {
            made->put(u"Value", value);
        }
        return made;
    }

    void set(Nodes nodes) { store.setNodes(nodes); }

    void remove(Paths paths) { store.removeNodes(paths); }

    void make(Paths paths) { store.createPaths(paths); }

    test::TemporaryFolder folder;
    TreeMetadataManager store{GetParam().makeBackend(folder.root()), folder.path(u".projectdata")};
    MetadataPath const a = at({{u"Top", u"a"}});
    MetadataPath const ab = a.child({u"Mid", u"b"});
    MetadataPath const abc = ab.child({u"Low", u"c"});
};

TEST_P(MetadataManagerContract, anEmptyStoreHasNothingAtItsTop) {
    EXPECT_THAT(store.getChildNodes(MetadataPath::root()), IsEmpty());
    EXPECT_FALSE(store.pathExists(a));
}

TEST_P(MetadataManagerContract, anAddressThatDoesNotExistHasNoChildrenAndIsNotAnError) {
    EXPECT_THAT(store.getChildNodes(ab), IsEmpty());
    EXPECT_EQ(store.getNode(ab), nullptr);
}

TEST_P(MetadataManagerContract, anAddressWithOnlyChildrenExistsWithoutANode) {
    set({{abc, node()}});
    EXPECT_EQ(store.getNode(ab), nullptr);
    EXPECT_FALSE(store.hasNode(ab));
    EXPECT_TRUE(store.pathExists(ab));
    EXPECT_THAT(store.getChildNodes(a), ElementsAre(ab));
}

TEST_P(MetadataManagerContract, aNodeIsReadBackWithItsTypeKeysAndChildrenInOrder) {
    auto stored = std::make_shared<MetadataNodeSpecification>(u"Kind");
    stored->put(u"b", u"2");
    stored->put(u"a", u"");
    auto* first = stored->addChild(u"Z");
    first->put(u"k", u"v");
    first->addChild(u"inner");
    stored->addChild(u"A");
    set({{a, stored}});

    auto const read = store.getNode(a);
    ASSERT_NE(read, nullptr);
    EXPECT_TRUE(isEqual(*read, *stored));
}

TEST_P(MetadataManagerContract, aNodeThatWasReadIsTheCallersOwn) {
    set({{a, node(u"1")}});
    store.getNode(a)->put(u"Value", u"2");
    EXPECT_EQ(store.getNode(a)->get(u"Value"), u"1");
}

TEST_P(MetadataManagerContract, changingANodeAfterItWasStoredChangesNothing) {
    auto const stored = node(u"1");
    set({{a, stored}});
    stored->put(u"Value", u"2");
    EXPECT_EQ(store.getNode(a)->get(u"Value"), u"1");
}

TEST_P(MetadataManagerContract, aNodeIsReplacedWhole) {
    auto first = std::make_shared<MetadataNodeSpecification>(u"Info");
    first->put(u"Other", u"x");
    first->addChild(u"Child");
    set({{a, first}});
    set({{a, node(u"1")}});
    EXPECT_EQ(store.getNode(a)->get(u"Other"), u"");
    EXPECT_THAT(store.getNode(a)->getChildren(), IsEmpty());
}

TEST_P(MetadataManagerContract, theNodesBelowSurviveAWriteAbove) {
    set({{a, node(u"1")}, {ab, node(u"2")}});
    set({{a, node(u"3")}});
    EXPECT_EQ(store.getNode(ab)->get(u"Value"), u"2");
}

TEST_P(MetadataManagerContract, childrenAreSortedByTypeThenLocationByCodeUnits) {
    set({{a.child({u"b", u"1"}), node()},
         {a.child({u"B", u"2"}), node()},
         {a.child({u"b", u""}), node()},
         {a.child({u"b", u"\xD83D\xDE00"}), node()},
         {a.child({u"b", u"\xFF21"}), node()}});
    EXPECT_THAT(store.getChildNodes(a),
                ElementsAre(a.child({u"B", u"2"}), a.child({u"b", u""}), a.child({u"b", u"1"}),
                            a.child({u"b", u"\xD83D\xDE00"}), a.child({u"b", u"\xFF21"})));
}

TEST_P(MetadataManagerContract, anEmptyBatchIsLegal) {
    set({});
    remove({});
    make({});
    EXPECT_THAT(store.getChildNodes(MetadataPath::root()), IsEmpty());
}

TEST_P(MetadataManagerContract, removingAnAddressRemovesEverythingBelowIt) {
    set({{a, node()}, {ab, node()}, {abc, node()}, {at({{u"Top", u"z"}}), node()}});
    remove({a});
    EXPECT_FALSE(store.pathExists(a));
    EXPECT_FALSE(store.pathExists(ab));
    EXPECT_FALSE(store.pathExists(abc));
    EXPECT_TRUE(store.hasNode(at({{u"Top", u"z"}})));
}

TEST_P(MetadataManagerContract, removingAMissingAddressIsNotAnError) {
    set({{a, node()}});
    remove({abc, at({{u"Top", u"unknown"}})});
    EXPECT_TRUE(store.hasNode(a));
}

TEST_P(MetadataManagerContract, removingAnAddressAndOneBelowItInOneBatchIsOneRemoval) {
    set({{a, node()}, {ab, node()}});
    remove({ab, a, a});
    EXPECT_FALSE(store.pathExists(a));
}

TEST_P(MetadataManagerContract, anAddressWithNothingLeftBelowItDoesNotExist) {
    set({{abc, node()}});
    remove({abc});
    EXPECT_FALSE(store.pathExists(ab));
    EXPECT_FALSE(store.pathExists(a));
    EXPECT_THAT(store.getChildNodes(MetadataPath::root()), IsEmpty());
}

TEST_P(MetadataManagerContract, anAddressAboveWithANodeOrAnotherChildStays) {
    set({{a, node()}, {abc, node()}, {ab.child({u"Low", u"d"}), node()}});
    remove({abc});
    EXPECT_TRUE(store.pathExists(ab));
    remove({ab.child({u"Low", u"d"})});
    EXPECT_FALSE(store.pathExists(ab));
    EXPECT_TRUE(store.hasNode(a));
}

TEST_P(MetadataManagerContract, aCreatedAddressExistsWithoutANodeUntilItIsRemoved) {
    make({ab});
    EXPECT_TRUE(store.pathExists(ab));
    EXPECT_FALSE(store.hasNode(ab));
    set({{abc, node()}});
    remove({abc});
    EXPECT_TRUE(store.pathExists(ab));
    remove({ab});
    EXPECT_FALSE(store.pathExists(a));
}

TEST_P(MetadataManagerContract, creatingAnExistingAddressChangesNothing) {
    set({{ab, node(u"1")}, {abc, node()}});
    make({ab, a});
    EXPECT_EQ(store.getNode(ab)->get(u"Value"), u"1");
    remove({ab});
    EXPECT_FALSE(store.pathExists(a)); // it existed because of the node below, and was not created
}

TEST_P(MetadataManagerContract, aCreatedAddressCanBeGivenANode) {
    make({a});
    set({{a, node(u"1")}});
    EXPECT_TRUE(store.hasNode(a));
}

TEST_P(MetadataManagerContract, aNullNodeOrTheRootAddressIsRefusedBeforeAnythingIsWritten) {
    EXPECT_THROW(set({{a, node()}, {ab, nullptr}}), std::invalid_argument);
    EXPECT_THROW(set({{a, node()}, {MetadataPath::root(), node()}}), std::invalid_argument);
    EXPECT_FALSE(store.pathExists(a));
}

TEST_P(MetadataManagerContract, anyCodeUnitsAreReadBackUnchanged) {
    std::u16string odd = u"\xD800 \xDC00\xDBFF\n\t\"\\/ \x05D0\x05D1";
    odd.push_back(0);
    odd.push_back(0xFFFF);
    auto stored = std::make_shared<MetadataNodeSpecification>(odd);
    stored->put(odd, odd);
    stored->addChild(odd)->put(odd, u"");
    set({{at({{odd, odd}, {u"Files", odd}}), stored}});
    EXPECT_TRUE(isEqual(*store.getNode(at({{odd, odd}, {u"Files", odd}})), *stored));
}

TEST_P(MetadataManagerContract, aWriterTakesTheReadLockAgainAndOthersWaitForTheOuterGuard) {
    auto writer = std::make_unique<cmlink::ReentrantReadWriteLock::LockGuard>(store.acquireWriteLock());
    {
        auto const again = store.acquireReadLock();
        auto const twice = store.acquireWriteLock();
        set({{a, node()}});
    }
    cmlink::Worker other([&] { auto const guard = store.acquireReadLock(); });
    other.untilItWaits();
    EXPECT_FALSE(other.isDone());
    writer.reset();
    other.join();
    EXPECT_TRUE(other.isDone());
}

TEST_P(MetadataManagerContract, createPathsCreatesItsAddressesInAnyOrder) {
    for (Paths const& paths : {Paths{ab, a}, Paths{a, ab}}) {
        make(paths);
        TreeMetadataManager again(GetParam().makeBackend(folder.root()), folder.path(u".projectdata"));
        auto& tree = GetParam().name == "memory" ? store : again;
        Paths below{ab};

        tree.removeNodes(below);

        EXPECT_FALSE(tree.pathExists(ab));
        EXPECT_TRUE(tree.pathExists(a)) << "it was created, so it stays when nothing is below it";
        Paths all{a};
        tree.removeNodes(all);
    }
}

TEST_P(MetadataManagerContract, removingTheRootRemovesEverything) {
    set({{a, node()}, {abc, node()}, {at({{u"Top", u"z"}}), node()}});

    remove({abc, MetadataPath::root()});

    EXPECT_THAT(store.getChildNodes(MetadataPath::root()), IsEmpty());
    EXPECT_FALSE(store.pathExists(abc));
}

class Listener : public metadata::FileChangeRequestListener {
public:
    void fileRemovalRequested(metadata::MetadataManager&, Path const&,
                              std::vector<Path> const& files) override {
        reports.push_back("removal");
        removed.insert(removed.end(), files.begin(), files.end());
        act();
    }

    void fileAdditionRequested(metadata::MetadataManager&, std::vector<Path> const& files) override {
        reports.push_back("addition");
        added.insert(added.end(), files.begin(), files.end());
        act();
    }

    bool acceptsFileChangeRequests() override { return accepts; }

    std::vector<std::string> reports;
    std::vector<Path> added;
    std::vector<Path> removed;
    bool accepts = true;
    std::function<void()> act = [] {};
};

TEST_P(MetadataManagerContract, everyWriteOfNodesNotifiesListenersOnce) {
    auto const listener = std::make_shared<Listener>();
    store.subscribe(listener);
    set({});
    set({{a, node()}});
    EXPECT_THAT(listener->reports, ElementsAre("addition", "addition"));
}

TEST_P(MetadataManagerContract, everyRemovalNotifiesListenersOnce) {
    set({{a, node()}});
    auto const listener = std::make_shared<Listener>();
    store.subscribe(listener);
    remove({a});
    remove({a});
    EXPECT_THAT(listener->reports, ElementsAre("removal", "removal"));
}

TEST_P(MetadataManagerContract, creatingAddressesReportsNothingWithoutFiles) {
    set({{a, node()}});
    auto const listener = std::make_shared<Listener>();
    store.subscribe(listener);
    make({ab});
    EXPECT_THAT(listener->reports, IsEmpty());
}

TEST_P(MetadataManagerContract, aDestroyedListenerAndOneThatDoesNotAcceptAreSkipped) {
    auto const refusing = std::make_shared<Listener>();
    refusing->accepts = false;
    store.subscribe(refusing);
    store.subscribe(std::make_shared<Listener>());
    set({{a, node()}});
    EXPECT_THAT(refusing->reports, IsEmpty());
    EXPECT_TRUE(store.hasNode(a));
}

TEST_P(MetadataManagerContract, aListenerSeesTheWriteThatItIsNotifiedOf) {
    auto const listener = std::make_shared<Listener>();
    bool seen = false;
    listener->act = [&] { seen = store.hasNode(a) && store.getChildNodes(MetadataPath::root()).size() == 1; };
    store.subscribe(listener);
    set({{a, node()}});
    EXPECT_TRUE(seen);
}

TEST_P(MetadataManagerContract, aListenerThatWritesGetsAnErrorAndTheWriteIsRolledBack) {
    auto const listener = std::make_shared<Listener>();
    listener->act = [&] { set({{ab, node()}}); };
    store.subscribe(listener);
    try {
        set({{a, node()}});
        ADD_FAILURE() << "the write of the listener was accepted";
    } catch (StoreError const& error) {
        EXPECT_EQ(StoreError::Kind::Refused, error.kind());
    }
    EXPECT_FALSE(store.pathExists(a));
}

TEST_P(MetadataManagerContract, anExceptionOfAListenerRollsBackTheWriteAndPropagates) {
    set({{a, node(u"old")}, {abc, node(u"deep")}, {at({{u"Top", u"z"}}), node()}});
    auto const listener = std::make_shared<Listener>();
    listener->act = [] { throw std::runtime_error("source control is locked"); };
    store.subscribe(listener);

    EXPECT_THROW(set({{a, node(u"new")}, {at({{u"New", u"x"}, {u"New", u"y"}}), node()}}),
                 std::runtime_error);
    EXPECT_THROW(remove({ab, at({{u"Top", u"z"}})}), std::runtime_error);

    listener->act = [] {};
    EXPECT_EQ(store.getNode(a)->get(u"Value"), u"old");
    EXPECT_EQ(store.getNode(abc)->get(u"Value"), u"deep");
    EXPECT_TRUE(store.hasNode(at({{u"Top", u"z"}})));
    EXPECT_FALSE(store.pathExists(at({{u"New", u"x"}})));
    set({{a, node(u"new")}});
    EXPECT_EQ(store.getNode(a)->get(u"Value"), u"new");
}

TEST_P(MetadataManagerContract, listenersThatWereAlreadyNotifiedAreNotifiedOfTheReverse) {
    auto const first = std::make_shared<Listener>();
    auto const second = std::make_shared<Listener>();
    second->act = [] { throw std::runtime_error("no"); };
    store.subscribe(first);
    store.subscribe(second);
    EXPECT_THROW(set({{a, node()}}), std::runtime_error);
    EXPECT_EQ(first->removed, first->added); // the files of the store that was being created, or none
    EXPECT_EQ(first->reports.size(), first->added.empty() ? 1U : 2U);
}

TEST_P(MetadataManagerContract, anExceptionInTheReverseDoesNotHideTheErrorOfTheWrite) {
    auto const first = std::make_shared<Listener>();
    auto const second = std::make_shared<Listener>();
    auto const third = std::make_shared<Listener>();
    second->act = [&] {
        if (second->reports.back() == "removal") {
            throw std::runtime_error("the reverse failed");
        }
    };
    third->act = [] { throw std::runtime_error("the write failed"); };
    for (auto const& listener : {first, second, third}) {
        store.subscribe(listener);
    }

    EXPECT_THAT([&] { set({{a, node()}}); }, testing::ThrowsMessage<std::runtime_error>("the write failed"));
    EXPECT_FALSE(store.pathExists(a));
    EXPECT_EQ(first->removed, first->added) << "it is notified although another one threw";
}

TEST_P(MetadataManagerContract, readersShareTheStoreWhileItIsLoaded) {
    Nodes nodes;
    for (int folderNumber = 0; folderNumber < 20; ++folderNumber) {
        for (int file = 0; file < 20; ++file) {
            auto const name = [](int number) {
                return std::u16string(1, static_cast<char16_t>(u'a' + number));
            };
            nodes.emplace(at({{u"Files", u"Root"}, {u"File", name(folderNumber)}, {u"File", name(file)}}),
                          node());
        }
    }
    store.setNodes(nodes);
    TreeMetadataManager again(GetParam().makeBackend(folder.root()), folder.path(u".projectdata"));
    auto& readFrom = GetParam().name == "memory" ? store : again;
    std::vector<std::thread> readers;
    std::atomic<std::size_t> found = 0;
    for (int reader = 0; reader < 4; ++reader) {
        readers.emplace_back([&] {
            for (auto const& child : readFrom.getChildNodes(at({{u"Files", u"Root"}}))) {
                found += readFrom.getChildNodes(child).size();
            }
        });
    }
    for (auto& reader : readers) {
        reader.join();
    }
    EXPECT_EQ(found, 4U * 400U);
}

} // namespace project::stores::contract

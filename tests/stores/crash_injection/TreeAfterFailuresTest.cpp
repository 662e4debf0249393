#include <set>

#include "project/metadata/FileChangeRequestListener.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/TextStore.hpp"

using testing::AnyOf;
using testing::Eq;

namespace project::test {

namespace {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using stores::TreeMetadataManager;

/// Keeps the set of files that exist according to the notifications.
class Listener : public metadata::FileChangeRequestListener {
public:
    void fileRemovalRequested(metadata::MetadataManager& /*store*/, Path const& /*root*/,
                              std::vector<Path> const& files) override {
        for (auto const& file : files) {
            EXPECT_EQ(1U, there.erase(file)) << "the deleted file was never reported as created";
            ++removals;
        }
    }

    void fileAdditionRequested(metadata::MetadataManager& /*store*/,
                               std::vector<Path> const& files) override {
        for (auto const& file : files) {
            EXPECT_TRUE(there.insert(file).second) << "the file was reported before";
        }
    }

    bool acceptsFileChangeRequests() override { return true; }

    std::set<Path> there;
    std::size_t removals = 0;
};

using Write = void (*)(TreeMetadataManager&);

void addAndChange(TreeMetadataManager& tree) {
    std::map<Address, std::shared_ptr<MetadataNode>> nodes;
    auto const changed = std::make_shared<MetadataNodeSpecification>(u"Info");
    changed->put(u"Key", u"value");
    nodes.emplace(fileAddress(u"many/0000"), changed);
    nodes.emplace(fileAddress(u"new"), std::make_shared<MetadataNodeSpecification>(u"Info"));
    tree.setNodes(nodes);
}

void removeSome(TreeMetadataManager& tree) {
    std::vector<Address> addresses{fileAddress(u"many/0001"), fileAddress(u"not there")};
    tree.removeNodes(addresses);
}

void addAnother(TreeMetadataManager& tree) {
    std::map<Address, std::shared_ptr<MetadataNode>> nodes;
    nodes.emplace(fileAddress(u"another"), std::make_shared<MetadataNodeSpecification>(u"Info"));
    tree.setNodes(nodes);
}

void makeSome(TreeMetadataManager& tree) {
    std::vector<Address> addresses{addressOf({u"Made", u"here"})};
    tree.createPaths(addresses);
}

/// Writes of every kind, with one that is rolled back.
void changeMuchInATransaction(TreeMetadataManager& tree) {
    auto transaction = tree.transaction();
    addAndChange(tree);
    removeSome(tree);
    {
        auto const rolledBack = tree.transaction();
        addAnother(tree);
        removeSome(tree);
    }
    makeSome(tree);
    transaction.commit();
}

/// All answers of a tree.
void collect(TreeMetadataManager& tree, Address const& parent, Content& content) {
    for (auto const& child : tree.getChildNodes(parent)) {
        EXPECT_TRUE(tree.pathExists(child));
        auto const node = tree.getNode(child);
        EXPECT_EQ(node != nullptr, tree.hasNode(child));
        content.emplace(child, node ? stores::samples::described(*node) : "no node");
        collect(tree, child, content);
    }
}

Content contentOfTree(TreeMetadataManager& tree) {
    auto const guard = tree.acquireReadLock();
    Content content;
    collect(tree, Address::root(), content);
    return content;
}

std::unique_ptr<TreeMetadataManager> openTree(std::shared_ptr<CrashingVolume> const& volume,
                                              TextBackend::Options options) {
    return std::make_unique<TreeMetadataManager>(
        std::make_unique<TextBackend>(std::make_unique<CrashingDisk>(volume), options),
        u"/project/.projectdata");
}

/// A tree with a fault in one call after another.
class TreeAfterFailures : public TextStore {
protected:
    using InjectedFault = CrashingVolume::InjectedFault;

    /// @return false if the write makes fewer calls.
    bool writeWithFault(Write write, Options options, InjectedFault fault, std::size_t call);

    void failEverywhere(Write write, Options options) {
        for (auto const fault : {InjectedFault::Fails, InjectedFault::FailsForGood}) {
            for (std::size_t call = 0; writeWithFault(write, options, fault, call); ++call) {
            }
        }
    }

    std::size_t failures = 0;
    std::size_t reversals = 0;
};

bool TreeAfterFailures::writeWithFault(Write write, Options options, InjectedFault fault, std::size_t call) {
    auto const twin = openTree(volume->copy(1), options);
    write(*twin);
    auto const after = contentOfTree(*twin);
    auto const now = volume->copy(1);
    auto const tree = openTree(now, options);
    auto const listener = std::make_shared<Listener>();
    tree->subscribe(listener);
    auto const before = contentOfTree(*tree);
    SCOPED_TRACE("fault at call " + std::to_string(call));

    now->plan(fault, call);
    std::optional<StoreError> failure;
    try {
        write(*tree);
    } catch (StoreError const& error) {
        failure = error;
    }
    now->cancelPlan();

    auto const found = contentOfTree(*openTree(now, options));
    EXPECT_EQ(found, contentOfTree(*tree));
    if (!failure) {
        EXPECT_EQ(after, found);
        return !now->faulted().empty();
    }
    ++failures;
    reversals += listener->removals;
    EXPECT_TRUE(listener->there.empty()) << "it was notified of files of a failed write";
    bool const isKnown = failure->kind() != StoreError::Kind::OutcomeUnknown;
    if (isKnown) {
        EXPECT_EQ(before, found);
        write(*tree);
        EXPECT_EQ(after, contentOfTree(*tree));
        EXPECT_EQ(after, contentOfTree(*openTree(now, options)));
    } else {
        EXPECT_THAT(found, AnyOf(Eq(before), Eq(after)));
        EXPECT_EQ(StoreError::Kind::Refused, errorOf([&] { addAnother(*tree); }).kind());
    }
    return true;
}

TEST_F(TreeAfterFailures, aWriteThatFailsAtAnyCallLeavesTheTreeAsItWas) {
    prepare(manyFiles(20));

    for (auto const write : {addAndChange, removeSome, makeSome, changeMuchInATransaction}) {
        failEverywhere(write, rewriting());
        failEverywhere(write, appending());
    }
    volume->canExchange = false;
    failEverywhere(addAndChange, rewriting());

    EXPECT_GT(failures, 150U);
    EXPECT_EQ(0U, reversals) << "a later batch creates and deletes no file";
}

TEST_F(TreeAfterFailures, aFirstWriteThatFailsAtAnyCallNotifiesListenersOfTheDeletion) {
    for (auto const write : {addAndChange, makeSome, changeMuchInATransaction}) {
        failEverywhere(write, rewriting());
    }

    EXPECT_GT(failures, 50U);
    EXPECT_GT(reversals, 50U) << "files were created before the failure";
}

} // namespace

} // namespace project::test

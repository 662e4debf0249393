#include "references/FolderReferenceManagerBase.hpp"

#include <stdexcept>
#include <utility>

#include <gmock/gmock.h>

#include "support/RecordingMetadataManager.hpp"

namespace project::management {
namespace {

using metadata::MetadataPath;
using test::address;
using testing::ElementsAre;
using testing::IsEmpty;
using Guard = test::StoreCall::Guard;

MetadataPath const HEAD = address({{u"Folders", u"Here"}});

MetadataPath referenceAt(std::u16string const& uuid) {
    return HEAD.child({u"Reference", uuid});
}

/// A new reference whose location is the stored path.
FolderReference absolute(std::u16string const& path, std::u16string const& uuid) {
    return FolderReference(path, u"Absolute", path, uuid);
}

std::vector<std::u16string> uuidsOf(std::vector<FolderReference> const& references) {
    std::vector<std::u16string> result;
    for (auto const& reference : references) {
        result.push_back(reference.getUUID());
    }
    return result;
}

/// Thrown for a location that is in the list already.
struct Duplicate {
    Path location;
};

/// A list that records the references that it validates.
class TestCustomization : public FolderReferenceCustomization {
public:
    explicit TestCustomization(std::vector<std::u16string>& validated) : validated_(validated) {
        readers_.push_back(std::make_unique<RelativeFolderReferenceReader>(u"/project"));
        readers_.push_back(std::make_unique<AbsoluteFolderReferenceReader>());
    }

    void validateReference(FolderReference const& reference) const override {
        validated_.push_back(reference.getUUID());
        if (reference.getUUID() == u"bad") {
            throw std::invalid_argument("bad reference");
        }
    }

    MetadataPath getRootPath() const override { return HEAD; }

    [[noreturn]] void throwDuplicate(Path const& location) const override { throw Duplicate{location}; }

    std::vector<std::unique_ptr<FolderReferenceReader>> const& getReaders() const override {
        return readers_;
    }

private:
    std::vector<std::u16string>& validated_;
    std::vector<std::unique_ptr<FolderReferenceReader>> readers_;
};

class FolderReferenceManagerBaseTest : public testing::Test {
protected:
    void put(std::u16string const& uuid, std::u16string const& path,
             std::u16string const& type = u"Absolute") {
        store->put(referenceAt(uuid), {{u"Ref", path}, {u"Type", type}});
    }

    std::vector<std::u16string> storedUUIDs() {
        std::vector<std::u16string> result;
        for (auto const& child : store->content().getChildNodes(HEAD)) {
            result.push_back(child.getLeaf().getLocation());
        }
        return result;
    }

    std::unique_ptr<TestCustomization> customization() {
        return std::make_unique<TestCustomization>(validated);
    }

    /// Adds references and returns the location that was reported as a duplicate.
    Path duplicateOf(std::vector<FolderReference> const& references) {
        try {
            manager.addReferences(references);
        } catch (Duplicate const& duplicate) {
            return duplicate.location;
        }
        return u"none";
    }

    template <class Operation>
    void expectOnly(Guard guard, Operation const& operation) {
        store->clear();
        operation();
        ASSERT_FALSE(store->operations().empty());
        for (auto const& call : store->calls()) {
            EXPECT_TRUE(call.operation.starts_with("acquire") || call.guard == guard) << call.operation;
        }
    }

    std::vector<std::u16string> validated;
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>();
    FolderReferenceManagerBase manager{customization(), store, u"/project"};
};

/// A manager that lists references that are not stored.
class FixedListManager : public FolderReferenceManagerBase {
public:
    using FolderReferenceManagerBase::FolderReferenceManagerBase;

    std::vector<FolderReference> getReferences() const override { return {absolute(u"/fixed", u"f")}; }
};

TEST_F(FolderReferenceManagerBaseTest, constructionDoesNotAccessTheStore) {
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(FolderReferenceManagerBaseTest, aNewStoreHasNoReferencesAndItsChildrenAreNotRead) {
    EXPECT_THAT(manager.getReferences(), IsEmpty());
    EXPECT_FALSE(manager.isReference(u"/a"));
    EXPECT_FALSE(manager.getRootReferenceFor(u"/a").has_value());
    EXPECT_THAT(store->operations(), ElementsAre("pathExists", "pathExists", "pathExists"));
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(FolderReferenceManagerBaseTest, aReferenceIsStoredWithItsTextAndTypeOnly) {
    manager.addReferences({FolderReference(u"/project/a", u"Relative", u"a", u"x")});
    auto const node = store->content().getNode(referenceAt(u"x"));
    ASSERT_NE(node, nullptr);
    EXPECT_EQ(node->getType(), u"Info");
    EXPECT_THAT(node->getKeys(), ElementsAre(u"Ref", u"Type"));
    EXPECT_EQ(node->get(u"Ref"), u"a");
    EXPECT_EQ(node->get(u"Type"), u"Relative");
}

TEST_F(FolderReferenceManagerBaseTest, addedReferencesAreListedInTheOrderOfTheStore) {
    manager.addReferences({absolute(u"/a", u"z"), absolute(u"/b", u"y")});
    auto const references = manager.getReferences();
    EXPECT_THAT(uuidsOf(references), ElementsAre(u"y", u"z"));
    EXPECT_EQ(references.at(0).getLocation(), Path(u"/b"));
    EXPECT_EQ(references.at(0).getStoredPath(), u"/b");
    EXPECT_EQ(references.at(0).getType(), u"Absolute");
}

TEST_F(FolderReferenceManagerBaseTest, writingAReadReferenceStoresTheSameNode) {
    put(u"x", u"b/../a", u"Relative");
    auto const before = store->content().getNode(referenceAt(u"x"));
    auto const references = manager.getReferences();
    manager.removeReferences(references);
    ASSERT_FALSE(store->content().hasNode(referenceAt(u"x")));
    manager.addReferences(references);
    EXPECT_TRUE(isEqual(*store->content().getNode(referenceAt(u"x")), *before));
}

TEST_F(FolderReferenceManagerBaseTest, addingChecksThenCreatesTheHeadThenWritesOnce) {
    put(u"x", u"/x");
    manager.addReferences({absolute(u"/b", u"b"), absolute(u"/a", u"a")});
    EXPECT_THAT(store->operations(),
                ElementsAre("pathExists", "getChildNodes", "getNode", "createPaths", "setNodes"));
    EXPECT_THAT(store->calls("createPaths").at(0).paths, ElementsAre(HEAD));
    EXPECT_THAT(store->calls("setNodes").at(0).paths, ElementsAre(referenceAt(u"a"), referenceAt(u"b")));
}

TEST_F(FolderReferenceManagerBaseTest, addingNothingCreatesTheHeadAndNoReference) {
    manager.addReferences({});
    EXPECT_THAT(store->writes(), ElementsAre("createPaths", "setNodes"));
    EXPECT_THAT(store->calls("setNodes").at(0).paths, IsEmpty());
    EXPECT_TRUE(store->content().pathExists(HEAD));
    EXPECT_THAT(storedUUIDs(), IsEmpty());
}

TEST_F(FolderReferenceManagerBaseTest, eachReferenceIsValidatedInTheOrderGiven) {
    manager.addReferences({absolute(u"/b", u"b"), absolute(u"/a", u"a"), absolute(u"/c", u"a")});
    EXPECT_THAT(validated, ElementsAre(u"b", u"a", u"a"));
}

TEST_F(FolderReferenceManagerBaseTest, aFailedValidationStoresNoReferenceAndKeepsTheEmptyHead) {
    EXPECT_THROW(manager.addReferences({absolute(u"/a", u"a"), absolute(u"/b", u"bad")}),
                 std::invalid_argument);
    EXPECT_THAT(store->writes(), ElementsAre("createPaths"));
    EXPECT_THAT(storedUUIDs(), IsEmpty());
    store->clear();
    manager.getReferences();
    EXPECT_EQ(store->calls().at(0).guard, Guard::None);
}

TEST_F(FolderReferenceManagerBaseTest, aStoredLocationIsADuplicateAndNothingIsWritten) {
    put(u"x", u"/a");
    EXPECT_EQ(duplicateOf({absolute(u"/b", u"b"), absolute(u"/a", u"a")}), Path(u"/a"));
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(validated, IsEmpty());
    EXPECT_THAT(storedUUIDs(), ElementsAre(u"x"));
}

TEST_F(FolderReferenceManagerBaseTest, twoReferencesToOneStoredLocationAreADuplicateToo) {
    put(u"x", u"/a");
    EXPECT_EQ(duplicateOf({absolute(u"/a", u"a"), absolute(u"/a", u"b")}), Path(u"/a"));
    EXPECT_THAT(storedUUIDs(), ElementsAre(u"x"));
}

TEST_F(FolderReferenceManagerBaseTest, ofSeveralDuplicatesTheFirstInPathOrderIsReported) {
    // As text "/p/a.b" comes first; as paths, "/p/a/b" does.
    put(u"x", u"/p/a.b");
    put(u"y", u"/p/a/b");
    EXPECT_EQ(duplicateOf({absolute(u"/p/a.b", u"a"), absolute(u"/p/a/b", u"b")}), Path(u"/p/a/b"));
}

TEST_F(FolderReferenceManagerBaseTest, twoNewReferencesToOneLocationAreBothStored) {
    manager.addReferences({absolute(u"/a", u"a"), absolute(u"/a", u"b")});
    EXPECT_THAT(uuidsOf(manager.getReferences()), ElementsAre(u"a", u"b"));
}

TEST_F(FolderReferenceManagerBaseTest, addingTheSameReferenceInASecondCallIsADuplicate) {
    auto const reference = absolute(u"/a", u"a");
    manager.addReferences({reference});
    EXPECT_EQ(duplicateOf({reference}), Path(u"/a"));
}

TEST_F(FolderReferenceManagerBaseTest, theLocationCountsAndNotTheStoredText) {
    put(u"x", u"a", u"Relative");
    EXPECT_EQ(duplicateOf({absolute(u"/project/a", u"y")}), Path(u"/project/a"));
    EXPECT_EQ(duplicateOf({FolderReference(u"/elsewhere", u"Relative", u"a", u"y")}), Path(u"none"));
}

TEST_F(FolderReferenceManagerBaseTest, aStoredUUIDIsReplaced) {
    put(u"x", u"/a");
    manager.addReferences({absolute(u"/b", u"x")});
    ASSERT_EQ(manager.getReferences().size(), 1U);
    EXPECT_EQ(manager.getReferences().at(0).getLocation(), Path(u"/b"));
}

TEST_F(FolderReferenceManagerBaseTest, theLaterOfTwoNewReferencesWithOneUUIDIsStored) {
    manager.addReferences({absolute(u"/a", u"x"), absolute(u"/b", u"x")});
    ASSERT_EQ(manager.getReferences().size(), 1U);
    EXPECT_EQ(manager.getReferences().at(0).getLocation(), Path(u"/b"));
}

TEST_F(FolderReferenceManagerBaseTest, aReferenceOfAnUnknownTypeIsNeitherListedNorADuplicate) {
    put(u"x", u"/a", u"Elsewhere");
    put(u"y", u"/a", u"");
    EXPECT_THAT(manager.getReferences(), IsEmpty());
    EXPECT_FALSE(manager.isReference(u"/a"));
    EXPECT_EQ(duplicateOf({absolute(u"/a", u"a")}), Path(u"none"));
    EXPECT_THAT(storedUUIDs(), ElementsAre(u"a", u"x", u"y"));
}

TEST_F(FolderReferenceManagerBaseTest, addressesOfOtherTypesBelowTheHeadAreNotRead) {
    store->put(HEAD.child({u"Other", u"x"}), {{u"Ref", u"/a"}, {u"Type", u"Absolute"}});
    EXPECT_THAT(manager.getReferences(), IsEmpty());
    EXPECT_THAT(store->calls("getNode"), IsEmpty());
}

TEST_F(FolderReferenceManagerBaseTest, anAddressWithoutANodeIsSkipped) {
    store->put(referenceAt(u"x").child({u"Below", u"1"}), {});
    put(u"y", u"/a");
    EXPECT_THAT(uuidsOf(manager.getReferences()), ElementsAre(u"y"));
}

TEST_F(FolderReferenceManagerBaseTest, anInaccessibleFolderDoesNotHideTheOthers) {
    put(u"x", u"no \xD800 name", u"Relative"); // no file on disk can have that name
    put(u"y", u"/a");
    auto const references = manager.getReferences();
    EXPECT_THAT(uuidsOf(references), ElementsAre(u"x", u"y"));
    EXPECT_EQ(references.at(0).getLocation(), Path(u"/project/no \xD800 name"));
}

TEST_F(FolderReferenceManagerBaseTest, removingSkipsReferencesThatAreNotStored) {
    put(u"x", u"/a");
    put(u"y", u"/b");
    put(u"z", u"/c");
    manager.removeReferences({absolute(u"/c", u"z"), absolute(u"/d", u"unknown"), absolute(u"/a", u"x")});
    EXPECT_THAT(store->operations(), ElementsAre("pathExists", "pathExists", "pathExists", "removeNodes"));
    EXPECT_THAT(store->calls("removeNodes").at(0).paths, ElementsAre(referenceAt(u"z"), referenceAt(u"x")));
    EXPECT_THAT(storedUUIDs(), ElementsAre(u"y"));
}

TEST_F(FolderReferenceManagerBaseTest, removingUsesTheUUIDOnly) {
    put(u"x", u"/a");
    put(u"y", u"/b", u"Elsewhere");
    manager.removeReferences({absolute(u"/other", u"x"), absolute(u"/another", u"y")});
    EXPECT_THAT(storedUUIDs(), IsEmpty());
}

TEST_F(FolderReferenceManagerBaseTest, removingALocationUnderAnotherUUIDRemovesNothing) {
    put(u"x", u"/a");
    manager.removeReferences({absolute(u"/a", u"other")});
    EXPECT_THAT(storedUUIDs(), ElementsAre(u"x"));
}

TEST_F(FolderReferenceManagerBaseTest, removingNothingStillCallsTheStoreOnce) {
    manager.removeReferences({});
    ASSERT_THAT(store->operations(), ElementsAre("removeNodes"));
    EXPECT_THAT(store->calls("removeNodes").at(0).paths, IsEmpty());
}

TEST_F(FolderReferenceManagerBaseTest, theHeadStaysWhenTheLastReferenceIsRemoved) {
    manager.addReferences({absolute(u"/a", u"a")});
    manager.removeReferences(manager.getReferences());
    EXPECT_THAT(storedUUIDs(), IsEmpty());
    EXPECT_TRUE(store->content().pathExists(HEAD));
}

TEST_F(FolderReferenceManagerBaseTest, aReferencesLocationIsAReferenceAndAFolderBelowIsNot) {
    put(u"x", u"/a");
    EXPECT_TRUE(manager.isReference(u"/a"));
    EXPECT_FALSE(manager.isReference(u"/a/b"));
    EXPECT_FALSE(manager.isReference(u"/"));
}

TEST_F(FolderReferenceManagerBaseTest, aPathIsComparedAsItIsSpelled) {
    put(u"x", u"/a");
    EXPECT_FALSE(manager.isReference(u"/a/"));
    EXPECT_FALSE(manager.isReference(u"/b/../a"));
    EXPECT_FALSE(manager.isReference(u"/A"));
}

TEST_F(FolderReferenceManagerBaseTest, aFolderBelowAReferenceAndTheReferenceItselfHaveItAsTheirRoot) {
    put(u"x", u"/a/b");
    ASSERT_TRUE(manager.getRootReferenceFor(u"/a/b/c/d").has_value());
    EXPECT_EQ(manager.getRootReferenceFor(u"/a/b/c/d")->getUUID(), u"x");
    ASSERT_TRUE(manager.getRootReferenceFor(u"/a/b").has_value());
    EXPECT_EQ(manager.getRootReferenceFor(u"/a/b")->getUUID(), u"x");
}

TEST_F(FolderReferenceManagerBaseTest, anUnrelatedFolderHasNoRootReference) {
    put(u"x", u"/a/b");
    EXPECT_FALSE(manager.getRootReferenceFor(u"/a/bc").has_value());
    EXPECT_FALSE(manager.getRootReferenceFor(u"/a").has_value());
    EXPECT_FALSE(manager.getRootReferenceFor(u"/c").has_value());
}

TEST_F(FolderReferenceManagerBaseTest, ofNestedReferencesTheFirstInTheStoresOrderCounts) {
    put(u"m", u"/a/b");
    put(u"n", u"/a");
    EXPECT_EQ(manager.getRootReferenceFor(u"/a/b/c")->getUUID(), u"m");
    put(u"l", u"/");
    EXPECT_EQ(manager.getRootReferenceFor(u"/a/b/c")->getUUID(), u"l");
    EXPECT_EQ(manager.getRootReferenceFor(u"/a/b")->getUUID(), u"l");
}

TEST_F(FolderReferenceManagerBaseTest, theReferencesThatASubclassListsCount) {
    FixedListManager fixed(customization(), store, u"/project");
    EXPECT_TRUE(fixed.isReference(u"/fixed"));
    EXPECT_TRUE(fixed.getRootReferenceFor(u"/fixed/a").has_value());
    EXPECT_THROW(fixed.addReferences({absolute(u"/fixed", u"x")}), Duplicate);
}

TEST_F(FolderReferenceManagerBaseTest, guardsAreHeldFromTheFirstStoreCallToTheLast) {
    put(u"x", u"/a");
    expectOnly(Guard::Read, [&] { manager.getReferences(); });
    expectOnly(Guard::Read, [&] { manager.isReference(u"/a"); });
    expectOnly(Guard::Read, [&] { manager.getRootReferenceFor(u"/a"); });
    expectOnly(Guard::Write, [&] { manager.addReferences({absolute(u"/b", u"b")}); });
    expectOnly(Guard::Write, [&] { manager.removeReferences({absolute(u"/b", u"b")}); });
}

TEST_F(FolderReferenceManagerBaseTest, exceptionsOfTheStorePropagate) {
    store->failOn("setNodes", [] { throw std::runtime_error("disk full"); });
    EXPECT_THROW(manager.addReferences({absolute(u"/a", u"a")}), std::runtime_error);
    EXPECT_THAT(storedUUIDs(), IsEmpty());
}

} // namespace
} // namespace project::management

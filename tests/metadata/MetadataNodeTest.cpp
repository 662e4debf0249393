#include <gmock/gmock.h>

#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::metadata {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(MetadataNode, aKeyNeverPutReadsAsAnEmptyString) {
    MetadataNodeSpecification const node;
    EXPECT_EQ(node.get(u"absent"), u"");
    EXPECT_THAT(node.getKeys(), IsEmpty());
    EXPECT_THAT(node.getChildren(), IsEmpty());
    EXPECT_EQ(node.getType(), u"");
}

TEST(MetadataNode, puttingAKeyAgainReplacesItsValue) {
    MetadataNodeSpecification node(u"Info");
    node.put(u"b", u"1");
    node.put(u"a", u"2");
    node.put(u"b", u"3");
    EXPECT_EQ(node.get(u"b"), u"3");
    EXPECT_THAT(node.getKeys(), ElementsAre(u"a", u"b"));
}

TEST(MetadataNode, childrenKeepTheOrderInWhichTheyWereAdded) {
    MetadataNodeSpecification node;
    auto* z = node.addChild(u"z");
    z->put(u"key", u"value");
    node.addChild(u"a");
    ASSERT_EQ(node.getChildren().size(), 2U);
    EXPECT_EQ(node.getChildren()[0].get(), z);
    EXPECT_EQ(node.getChildren()[0]->get(u"key"), u"value");
    EXPECT_EQ(node.getChildren()[1]->getType(), u"a");
}

TEST(MetadataNode, removingTheOnlyChildLeavesAnEmptyListAtOnce) {
    MetadataNodeSpecification node;
    node.removeChild(node.addChild(u"only"));
    EXPECT_THAT(node.getChildren(), IsEmpty());
}

TEST(MetadataNode, removingAPointerThatIsNotAChildChangesNothing) {
    MetadataNodeSpecification node;
    node.addChild(u"child");
    node.removeChild(&node);
    node.removeChild(nullptr);
    EXPECT_EQ(node.getChildren().size(), 1U);
}

TEST(MetadataNode, aCopyIsDeep) {
    MetadataNodeSpecification node(u"Info");
    node.put(u"key", u"value");
    node.addChild(u"child")->addChild(u"grandchild");
    MetadataNodeSpecification copy(static_cast<MetadataNode const&>(node));
    EXPECT_TRUE(isEqual(node, copy));
    copy.getChildren()[0]->put(u"key", u"changed");
    EXPECT_FALSE(isEqual(node, copy));
    EXPECT_EQ(node.getChildren()[0]->get(u"key"), u"");
}

TEST(MetadataNode, copiesThatShareValuesChangeIndependently) {
    MetadataNodeSpecification node(u"Info");
    node.put(u"a", u"1");
    node.put(u"b", u"1");
    node.addChild(u"child")->put(u"key", u"nested");
    node.shareValues();
    MetadataNodeSpecification changed(node);
    MetadataNodeSpecification const other(node);
    changed.put(u"b", u"2");
    changed.put(u"c", u"2");
    changed.getChildren()[0]->put(u"key", u"changed");
    EXPECT_THAT(changed.getKeys(), ElementsAre(u"a", u"b", u"c"));
    EXPECT_EQ(changed.get(u"a"), u"1");
    EXPECT_EQ(changed.get(u"b"), u"2");
    EXPECT_EQ(changed.getChildren()[0]->get(u"key"), u"changed");
    EXPECT_EQ(other.get(u"b"), u"1");
    EXPECT_EQ(other.getChildren()[0]->get(u"key"), u"nested");
    EXPECT_TRUE(isEqual(node, other));
    EXPECT_FALSE(isEqual(node, changed));
}

TEST(MetadataNode, aCopyOfAChangedCopyHasAllValues) {
    MetadataNodeSpecification node(u"Info");
    node.put(u"a", u"1");
    node.put(u"b", u"1");
    MetadataNodeSpecification changed(node);
    changed.put(u"b", u"2");
    MetadataNodeSpecification const copy(changed);
    EXPECT_TRUE(isEqual(changed, copy));
    EXPECT_THAT(copy.getKeys(), ElementsAre(u"a", u"b"));
    EXPECT_EQ(copy.get(u"b"), u"2");
}

TEST(MetadataNode, nodesWithTheSameValuesAreEqualWhicheverOfThemAreShared) {
    MetadataNodeSpecification node(u"Info");
    node.put(u"a", u"1");
    MetadataNodeSpecification changed(node);
    changed.put(u"b", u"2");
    node.put(u"b", u"2");
    EXPECT_TRUE(isEqual(node, changed));
    node.shareValues();
    changed.shareValues();
    EXPECT_TRUE(isEqual(node, changed));
    EXPECT_FALSE(isEqual(node, MetadataNodeSpecification(u"Info")));
}

TEST(MetadataNode, aReferenceToAValueOutlivesOtherNodesWithTheValue) {
    auto node = std::make_unique<MetadataNodeSpecification>(u"Info");
    node->put(u"a", u"a text that is too long to be stored in the string itself");
    node->shareValues();
    MetadataNodeSpecification copy(*node);
    auto const& text = copy.get(u"a");
    copy.put(u"b", u"2");
    node.reset();
    EXPECT_EQ(text, u"a text that is too long to be stored in the string itself");
}

/// A node that an application implements itself, with one key.
class OwnNode : public MetadataNode {
public:
    std::u16string const& get(std::u16string const& key) const override {
        static std::u16string const absent;
        return key == u"key" ? value_ : absent;
    }

    void put(std::u16string /*key*/, std::u16string value) override { value_ = std::move(value); }

    std::vector<std::u16string> getKeys() const override { return {u"key"}; }

    std::u16string const& getType() const override { return type_; }

    std::vector<std::unique_ptr<MetadataNode>> const& getChildren() const override { return children_; }

    MetadataNode* addChild(std::u16string type) override {
        return children_.emplace_back(std::make_unique<MetadataNodeSpecification>(std::move(type))).get();
    }

    void removeChild(MetadataNode* /*child*/) override {}

private:
    std::u16string value_;
    std::u16string type_ = u"Info";
    std::vector<std::unique_ptr<MetadataNode>> children_;
};

TEST(MetadataNode, aNodeOfAnyClassIsCopiedAndComparedByItsOperations) {
    OwnNode own;
    own.put(u"key", u"value");
    own.addChild(u"child")->put(u"inner", u"1");
    MetadataNodeSpecification copy(own);
    EXPECT_TRUE(isEqual(own, copy));
    EXPECT_TRUE(isEqual(copy, own));
    copy.put(u"key", u"other");
    EXPECT_FALSE(isEqual(own, copy));
    EXPECT_FALSE(isEqual(copy, own));
    copy.put(u"key", u"value");
    copy.put(u"another", u"");
    EXPECT_FALSE(isEqual(own, copy));
    EXPECT_FALSE(isEqual(copy, own));
}

TEST(MetadataNode, nodesDifferInTypeKeysValuesOrTheOrderOfChildren) {
    MetadataNodeSpecification const plain(u"Info");
    EXPECT_FALSE(isEqual(plain, MetadataNodeSpecification(u"Other")));
    MetadataNodeSpecification emptyValue(u"Info");
    emptyValue.put(u"key", u"");
    EXPECT_FALSE(isEqual(plain, emptyValue));
    MetadataNodeSpecification ab(u"Info");
    ab.addChild(u"a");
    ab.addChild(u"b");
    MetadataNodeSpecification ba(u"Info");
    ba.addChild(u"b");
    ba.addChild(u"a");
    EXPECT_FALSE(isEqual(ab, ba));
}

} // namespace
} // namespace project::metadata

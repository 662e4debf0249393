#include "project/metadata/MetadataPath.hpp"

#include <gmock/gmock.h>
#include <rapidcheck/gtest.h>

#include <thread>

#include "project/metadata/MetadataPathBuilder.hpp"

namespace project::metadata {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(MetadataPath, noElementsAreTheRoot) {
    EXPECT_THAT(MetadataPath(std::vector<PathElement>()).getPath(), IsEmpty());
    EXPECT_EQ(MetadataPath(std::vector<PathElement>()), MetadataPath::root());
    EXPECT_EQ(MetadataPath({}), MetadataPath::root());
    EXPECT_EQ(MetadataPath::root().getLeaf(), PathElement(u"", u""));
    EXPECT_EQ(MetadataPath::root().parent(), MetadataPath::root());
}

TEST(MetadataPath, elementsAreListedFromTheRootDown) {
    MetadataPath const path({PathElement(u"a", u"1"), PathElement(u"b", u"2")});
    EXPECT_THAT(path.getPath(), ElementsAre(PathElement(u"a", u"1"), PathElement(u"b", u"2")));
    EXPECT_EQ(path.getLeaf(), PathElement(u"b", u"2"));
    EXPECT_EQ(path[0], PathElement(u"a", u"1"));
    EXPECT_EQ(path.parent(), MetadataPath({PathElement(u"a", u"1")}));
    EXPECT_EQ(path.depth(), 2U);
}

TEST(MetadataPath, theListIsTheSameAtEachCallAndSafeForTwoThreads) {
    MetadataPath const path({PathElement(u"a", u"1"), PathElement(u"b", u"2")});
    std::vector<std::vector<PathElement> const*> lists(4);
    std::vector<std::thread> threads;
    for (auto& list : lists) {
        threads.emplace_back([&path, &list] { list = &path.getPath(); });
    }
    for (auto& thread : threads) {
        thread.join();
    }
    EXPECT_THAT(lists, testing::Each(&path.getPath()));
}

/// The address with the first steps of another one and further steps of the type "t".
MetadataPath replaced(MetadataPath path, std::size_t kept,
                      std::vector<std::u16string_view> const& locations) {
    path.replaceSteps(kept, u"t", locations);
    return path;
}

TEST(MetadataPath, theStepsBehindTheFirstOnesAreReplaced) {
    MetadataPath const path({PathElement(u"a", u"1"), PathElement(u"b", u"2"), PathElement(u"c", u"3")});
    EXPECT_EQ(replaced(path, 1, {u"x"}), MetadataPath({PathElement(u"a", u"1"), PathElement(u"t", u"x")}));
    EXPECT_EQ(replaced(path, 3, {u"x"}), path.child(PathElement(u"t", u"x")));
    EXPECT_EQ(replaced(path, 2, {}), path.parent());
    EXPECT_EQ(replaced(path, 0, {u"x"}), MetadataPath({PathElement(u"t", u"x")}));
    EXPECT_EQ(path,
              MetadataPath({PathElement(u"a", u"1"), PathElement(u"b", u"2"), PathElement(u"c", u"3")}));
}

TEST(MetadataPath, anAddressWhoseStepsAreReplacedDoesNotChangeOthers) {
    auto path = MetadataPath({PathElement(u"t", u"1"), PathElement(u"t", u"2"), PathElement(u"t", u"3")});
    auto const above = path.parent();
    auto const copy = path;
    path.replaceSteps(1, u"t", std::vector<std::u16string_view>{u"x", u"y", u"z"});
    EXPECT_EQ(path.getPath().size(), 4U);
    EXPECT_EQ(above, MetadataPath({PathElement(u"t", u"1"), PathElement(u"t", u"2")}));
    EXPECT_EQ(copy, above.child(PathElement(u"t", u"3")));

    // Now it alone contains the steps, and changes them in place.
    path.replaceSteps(1, u"s", std::vector<std::u16string_view>{u"p", u"q"});
    EXPECT_THAT(path.getPath(),
                ElementsAre(PathElement(u"t", u"1"), PathElement(u"s", u"p"), PathElement(u"s", u"q")));
    auto const child = path.child(PathElement(u"t", u"c"));
    path.replaceSteps(0, u"t", std::vector<std::u16string_view>{u"m", u"n", u"o"});
    EXPECT_EQ(child.parent().getLeaf(), PathElement(u"s", u"q"));
    EXPECT_EQ(path[0], PathElement(u"t", u"m"));
}

TEST(MetadataPath, anAddressIsWithinItselfAndThoseAboveIt) {
    MetadataPath const above({PathElement(u"a", u"1")});
    auto const below = MetadataPath({PathElement(u"a", u"1"), PathElement(u"b", u"2")});
    EXPECT_TRUE(below.isWithin(above));
    EXPECT_TRUE(below.isWithin(below));
    EXPECT_TRUE(below.isWithin(MetadataPath::root()));
    EXPECT_FALSE(above.isWithin(below));
    EXPECT_FALSE(MetadataPath({PathElement(u"a", u"11")}).isWithin(above));
}

TEST(MetadataPath, anAddressOfAnyLengthIsDestroyedWithoutADeepStack) {
    auto path = MetadataPath::root();
    for (int step = 0; step < 1'000'000; ++step) {
        path = path.child(PathElement(u"t", u"l"));
    }
    EXPECT_EQ(path.depth(), 1'000'000U);
}

RC_GTEST_PROP(MetadataPath, isOrderedLikeItsListOfElements, ()) {
    auto const element = rc::gen::construct<PathElement>(
        rc::gen::container<std::u16string>(rc::gen::element<char16_t>(u'a', u'b', u'\xD800')),
        rc::gen::container<std::u16string>(rc::gen::element<char16_t>(u'a', u'\xFFFF')));
    auto const elements = rc::gen::container<std::vector<PathElement>>(element);
    auto const shared = *elements;
    auto build = [&](std::vector<PathElement> const& rest) {
        auto path = MetadataPath(shared);
        for (auto const& one : rest) {
            path = path.child(one);
        }
        return path;
    };
    auto const left = build(*elements);
    auto const right = MetadataPath(build(*elements).getPath()); // shares no step with the left one
    RC_ASSERT((left < right) == (left.getPath() < right.getPath()));
    RC_ASSERT((left == right) == (left.getPath() == right.getPath()));
}

TEST(MetadataPathBuilder, appendsElementsAndWholeAddresses) {
    MetadataPath const head({PathElement(u"Categories", u"Root")});
    EXPECT_THAT(MetadataPathBuilder().add(head).add(u"Category", u"1").build().getPath(),
                ElementsAre(PathElement(u"Categories", u"Root"), PathElement(u"Category", u"1")));
}

} // namespace
} // namespace project::metadata

#include "fl/filesystem/Path.hpp"

#include <compare>
#include <set>
#include <utility>

#include <rapidcheck/gtest.h>

namespace fl::filesystem {

namespace {

using Text = std::u16string;

/// Short paths of few characters, so that two of them often share elements and have separators in unusual
/// places.
rc::Gen<std::string> pathText() {
    return rc::gen::scale(0.2,
                          rc::gen::container<std::string>(rc::gen::element('/', '/', 'a', 'b', '.', '-')));
}

Text widen(std::string const& text) {
    return {text.begin(), text.end()};
}

/// The elements, by the plainest algorithm.
std::vector<Text> elementsOf(Text const& path) {
    std::vector<Text> elements;
    if (!path.empty() && path.front() == u'/') {
        elements.push_back(u"/");
    }
    Text name;
    for (auto const unit : path + u"/") {
        if (unit != u'/') {
            name += unit;
        } else if (!name.empty()) {
            elements.push_back(std::exchange(name, Text()));
        }
    }
    return elements;
}

std::vector<Text> elementsByWalking(Text const& path) {
    std::vector<Text> elements;
    for (std::u16string_view rest = path; !rest.empty(); rest = detail::move_down(rest)) {
        elements.emplace_back(detail::extract_first_element(rest));
    }
    return elements;
}

std::strong_ordering order(Text const& left, Text const& right) {
    return detail::compare_elements(left, right);
}

} // namespace

TEST(Path, keepsItsTextAsGiven) {
    for (auto const* text : {u"", u"/", u"//a//b/", u"a/./../b", u"a\\b", u"\xD800"}) {
        Path const path(text);

        EXPECT_EQ(path.native(), text);
        EXPECT_TRUE(path.isNativeForm());
    }
}

TEST(Path, theFlagIsCopied) {
    Path const path(u"a");
    Path copy;
    copy = path;

    EXPECT_TRUE(copy.isNativeForm());
    EXPECT_EQ(copy, path);
}

TEST(Path, joinsWithOneSeparator) {
    EXPECT_EQ(Path(u"a") / u"b", Path(u"a/b"));
    EXPECT_EQ(Path(u"a/") / u"b", Path(u"a/b"));
    EXPECT_EQ(Path(u"a//") / u"b", Path(u"a//b"));
    EXPECT_EQ(Path(u"/") / u"b", Path(u"/b"));
    EXPECT_EQ(Path(u"a\\") / u"b", Path(u"a\\/b"));
    EXPECT_EQ(Path(u"a") / u"b/c/", Path(u"a/b/c/"));
}

TEST(Path, joiningWithAnEmptyPathLeavesTheLeftSideUnchanged) {
    EXPECT_EQ(Path(u"a") / u"", Path(u"a"));
    EXPECT_EQ(Path(u"a/") / u"", Path(u"a/"));
    EXPECT_EQ(Path(u"") / u"", Path(u""));
    EXPECT_EQ(Path(u"a") / u"//", Path(u"a"));
}

TEST(Path, anAbsoluteRightSideNeverReplacesTheLeftOne) {
    EXPECT_EQ(Path(u"/a") / u"/b", Path(u"/a/b"));
    EXPECT_EQ(Path(u"/a") / u"///b/c", Path(u"/a/b/c"));
    EXPECT_EQ(Path(u"") / u"/b", Path(u"b"));
}

TEST(Path, isEqualByTextAndNotByElements) {
    EXPECT_EQ(Path(u"a/b"), Path(u"a/b"));
    EXPECT_NE(Path(u"a/b"), Path(u"a//b"));
    EXPECT_NE(Path(u"a"), Path(u"a/"));
}

TEST(Path, aFolderPrecedesItsContentsAndTheseItsLongerNeighbours) {
    std::set<Path> const sorted = {u"a.b", u"a/b", u"a", u"a-", u"a/b/c", u"a/b-", u"/", u"-"};

    std::vector<Path> const expected = {u"-", u"/", u"a", u"a/b", u"a/b/c", u"a/b-", u"a-", u"a.b"};
    EXPECT_EQ(std::vector<Path>(sorted.begin(), sorted.end()), expected);
}

TEST(PathElements, theRootLengthIsTheNumberOfLeadingSeparators) {
    EXPECT_EQ(detail::get_root_path_length(u""), 0U);
    EXPECT_EQ(detail::get_root_path_length(u"a/b"), 0U);
    EXPECT_EQ(detail::get_root_path_length(u"/a"), 1U);
    EXPECT_EQ(detail::get_root_path_length(u"//a/b"), 2U);
    EXPECT_EQ(detail::get_root_path_length(u"///"), 3U);
}

TEST(PathElements, theFirstElementIsTheRootOrTheFirstName) {
    EXPECT_EQ(detail::extract_first_element(u""), u"");
    EXPECT_EQ(detail::extract_first_element(u"/"), u"/");
    EXPECT_EQ(detail::extract_first_element(u"///a"), u"/");
    EXPECT_EQ(detail::extract_first_element(u"a"), u"a");
    EXPECT_EQ(detail::extract_first_element(u"a//b"), u"a");
    EXPECT_EQ(detail::extract_first_element(u"a\\b/c"), u"a\\b");
}

TEST(PathElements, movingDownRemovesTheFirstElementAndTheSeparatorsAfterIt) {
    EXPECT_EQ(detail::move_down(u""), u"");
    EXPECT_EQ(detail::move_down(u"/"), u"");
    EXPECT_EQ(detail::move_down(u"//a/b"), u"a/b");
    EXPECT_EQ(detail::move_down(u"a//b/"), u"b/");
    EXPECT_EQ(detail::move_down(u"b/"), u"");
}

TEST(PathElements, theStemIsTheLastNameWithoutItsExtension) {
    EXPECT_EQ(detail::extract_stem(u"/a/b.txt"), u"b");
    EXPECT_EQ(detail::extract_stem(u"b.tar.gz"), u"b.tar");
    EXPECT_EQ(detail::extract_stem(u"a.b/c"), u"c");
    EXPECT_EQ(detail::extract_stem(u"a/b.txt//"), u"b");
    EXPECT_EQ(detail::extract_stem(u"b."), u"b");
    EXPECT_EQ(detail::extract_stem(u"a\\b.txt"), u"a\\b");
}

TEST(PathElements, aNameThatOnlyBeginsWithADotIsItsOwnStem) {
    EXPECT_EQ(detail::extract_stem(u"a/.profile"), u".profile");
    EXPECT_EQ(detail::extract_stem(u"a/.."), u"..");
    EXPECT_EQ(detail::extract_stem(u"."), u".");
    EXPECT_EQ(detail::extract_stem(u".a.b"), u".a");
    EXPECT_EQ(detail::extract_stem(u""), u"");
    EXPECT_EQ(detail::extract_stem(u"//"), u"/");
}

TEST(PathElements, theRootIsAnElementThatSortsAsItsText) {
    EXPECT_EQ(order(u"/", u"-"), std::strong_ordering::greater);
    EXPECT_EQ(order(u"/", u"a"), std::strong_ordering::less);
    EXPECT_EQ(order(u"/z", u"."), std::strong_ordering::greater);
    EXPECT_EQ(order(u"", u"/"), std::strong_ordering::less);
    EXPECT_EQ(order(u"/", u"/a"), std::strong_ordering::less);
}

TEST(PathElements, repeatedAndTrailingSeparatorsDoNotCount) {
    EXPECT_EQ(order(u"//a///b/", u"/a/b"), std::strong_ordering::equal);
    EXPECT_EQ(order(u"/", u"//"), std::strong_ordering::equal);
    EXPECT_EQ(order(u"a//b", u"a/c"), std::strong_ordering::less);
    EXPECT_EQ(order(u"a/c", u"a//b"), std::strong_ordering::greater);
    EXPECT_EQ(order(u"a//b/c//d", u"a/b//c/e"), std::strong_ordering::less);
}

TEST(PathElements, elementsAreComparedByCodeUnits) {
    EXPECT_EQ(order(u"\U00010000", u"\uFFFF"), std::strong_ordering::less);
    EXPECT_EQ(order(u"a\u00E9", u"az"), std::strong_ordering::greater);
    EXPECT_EQ(order(u"a\\b", u"a/b"), std::strong_ordering::greater);
}

RC_GTEST_PROP(PathElements, iterationReturnsTheElementsOfThePlainAlgorithm, ()) {
    auto const path = widen(*pathText());

    RC_ASSERT(elementsByWalking(path) == elementsOf(path));
}

RC_GTEST_PROP(PathElements, theOrderIsThatOfTheListsOfElements, ()) {
    auto const left = widen(*pathText());
    auto const right = widen(*pathText());

    RC_ASSERT(order(left, right) == (elementsOf(left) <=> elementsOf(right)));
}

RC_GTEST_PROP(PathElements, theOrderHoldsAfterLongCommonFolders, ()) {
    auto const common = widen(*rc::gen::container<std::string>(rc::gen::element('/', 'a', 'b')));
    auto const left = common + widen(*pathText());
    auto const right = common + widen(*pathText());

    RC_ASSERT(order(left, right) == (elementsOf(left) <=> elementsOf(right)));
}

RC_GTEST_PROP(PathElements, joiningJoinsTheElements, ()) {
    auto const left = widen(*pathText());
    auto const right = widen(*pathText());

    auto const joined = (Path(left) / Path(right)).native();

    auto expected = elementsOf(left);
    auto const below = elementsOf(u"x/" + right); // after a name, separators are not a root
    expected.insert(expected.end(), below.begin() + 1, below.end());
    RC_ASSERT(elementsOf(joined) == expected);
}

} // namespace fl::filesystem

#include "project/metadata/MetadataFunctions.hpp"

#include <algorithm>
#include <array>
#include <filesystem>
#include <set>
#include <thread>
#include <utility>

#include <sys/wait.h>
#include <unistd.h>

#include <gmock/gmock.h>
#include <rapidcheck/gtest.h>

#include "support/TemporaryFolder.hpp"

namespace project::metadata {

namespace {

using test::TemporaryFolder;
using Text = std::u16string;

/// Short paths of few characters, so that two of them often share elements and have separators in unusual
/// places.
Text anyPath() {
    auto const text =
        *rc::gen::scale(0.2, rc::gen::container<std::string>(rc::gen::element('/', '/', 'a', 'a', 'b', '.')));
    return {text.begin(), text.end()};
}

struct Cut {
    bool isAbsolute;
    std::vector<Text> names;
};

/// A path in elements, by the plainest algorithm.
Cut cut(Text const& path) {
    Cut result = {path.starts_with(u'/'), {}};
    Text name;
    for (auto const unit : path + u"/") {
        if (unit != u'/') {
            name += unit;
        } else if (!name.empty()) {
            result.names.push_back(std::exchange(name, Text()));
        }
    }
    return result;
}

Text join(std::vector<Text> const& names) {
    Text joined;
    for (auto const& name : names) {
        joined += (joined.empty() ? u"" : u"/") + name;
    }
    return joined;
}

/// The relative path, by the plainest algorithm.
Text relativeByHand(Text const& base, Text const& target) {
    auto const from = cut(base);
    auto const to = cut(target);
    auto steps = from.names.size();
    auto rest = to.names.begin();
    if (from.isAbsolute == to.isAbsolute) {
        auto const parting =
            std::mismatch(from.names.begin(), from.names.end(), to.names.begin(), to.names.end());
        steps = static_cast<std::size_t>(from.names.end() - parting.first);
        rest = parting.second;
    } else {
        steps = std::max<std::size_t>(1, steps + (from.isAbsolute ? 1 : 0));
    }
    std::vector<Text> names(steps, u"..");
    names.insert(names.end(), rest, to.names.end());
    return join(names);
}

bool isBelowByHand(Text const& folder, Text const& path) {
    auto const above = cut(folder);
    auto const below = cut(path);
    return above.isAbsolute == below.isAbsolute && above.names.size() < below.names.size() &&
           std::equal(above.names.begin(), above.names.end(), below.names.begin());
}

} // namespace

TEST(GetRelativePath, isTheTargetBelowTheBase) {
    EXPECT_EQ(getRelativePath(u"/a", u"/a/b"), u"b");
    EXPECT_EQ(getRelativePath(u"/a", u"/a/b/c.txt"), u"b/c.txt");
    EXPECT_EQ(getRelativePath(u"/", u"/a/b"), u"a/b");
    EXPECT_EQ(getRelativePath(u"a", u"a/b"), u"b");
    EXPECT_EQ(getRelativePath(u"", u"a/b"), u"a/b");
    EXPECT_EQ(textBelow(u"/a", u"/a/b/c.txt"), u"b/c.txt");
    EXPECT_EQ(textBelow(u"/", u"/a/b"), u"a/b");
    for (auto const* other : {u"/a", u"/a/", u"/ab", u"/a//b", u"/a/b//c", u"/a/b/", u"/b"}) {
        EXPECT_EQ(textBelow(u"/a", other), std::nullopt);
    }
}

TEST(TextBelow, findsARepeatedSeparatorAtEachPlaceOfALongPath) {
    std::u16string const names = u"/some/folder/with/a/longer/name";
    EXPECT_EQ(textBelow(u"/a", u"/a" + names), names.substr(1));
    for (std::size_t place = 0; place <= names.size(); ++place) {
        auto repeated = names;
        repeated.insert(place, u"//");
        EXPECT_EQ(textBelow(u"/a", u"/a" + repeated), std::nullopt) << place;
    }
}

TEST(GetRelativePath, isEmptyForTheSameElements) {
    EXPECT_EQ(getRelativePath(u"/a", u"/a"), u"");
    EXPECT_EQ(getRelativePath(u"/a", u"/a/"), u"");
    EXPECT_EQ(getRelativePath(u"//a//b/", u"/a/b"), u"");
    EXPECT_EQ(getRelativePath(u"/", u"//"), u"");
    EXPECT_EQ(getRelativePath(u"", u""), u"");
}

TEST(GetRelativePath, goesUpFromTheBaseToATargetOutside) {
    EXPECT_EQ(getRelativePath(u"/a/b", u"/a"), u"..");
    EXPECT_EQ(getRelativePath(u"/a/b", u"/a/c"), u"../c");
    EXPECT_EQ(getRelativePath(u"/a/b", u"/c/d"), u"../../c/d");
    EXPECT_EQ(getRelativePath(u"/a/b", u"/"), u"../..");
    EXPECT_EQ(getRelativePath(u"/a", u"/ab"), u"../ab");
    EXPECT_EQ(getRelativePath(u"/ab", u"/a"), u"../a");
}

TEST(GetRelativePath, beginsWithTwoDotsIfThereIsNoWayToTheTarget) {
    EXPECT_EQ(getRelativePath(u"/a", u"b/c"), u"../../b/c");
    EXPECT_EQ(getRelativePath(u"/a/b", u"a/b"), u"../../../a/b");
    EXPECT_EQ(getRelativePath(u"a/b", u"/a/b"), u"../../a/b");
    EXPECT_EQ(getRelativePath(u"/", u"a"), u"../a");
    EXPECT_EQ(getRelativePath(u"/", u""), u"..");
    EXPECT_EQ(getRelativePath(u"a", u"/b"), u"../b");
    EXPECT_EQ(getRelativePath(u"", u"/a"), u"../a");
    EXPECT_EQ(getRelativePath(u"", u"/"), u"..");
}

TEST(GetRelativePath, repeatedAndTrailingSeparatorsAreRemoved) {
    EXPECT_EQ(getRelativePath(u"/a/", u"/a/b"), u"b");
    EXPECT_EQ(getRelativePath(u"/a", u"/a//b///c/"), u"b/c");
    EXPECT_EQ(getRelativePath(u"//a", u"/a/b/"), u"b");
    EXPECT_EQ(getRelativePath(u"/a", u"/c//d/"), u"../c/d");
}

TEST(GetRelativePath, usesElementsUnchanged) {
    EXPECT_EQ(getRelativePath(u"/a", u"/a/b\\c"), u"b\\c");
    EXPECT_EQ(getRelativePath(u"/a", u"/a/./b"), u"./b");
    EXPECT_EQ(getRelativePath(u"/a", u"/a/\xD800"), u"\xD800");
}

TEST(GetRelativePath, aNameBelowTheBaseThatBeginsWithTwoDotsKeepsThem) {
    EXPECT_EQ(getRelativePath(u"/a", u"/a/..b"), u"..b");
    EXPECT_EQ(getRelativePath(u"/a", u"/a/../b"), u"../b");
}

RC_GTEST_PROP(GetRelativePath, isTheResultOfThePlainAlgorithm, ()) {
    auto const base = anyPath();
    auto const target = anyPath();

    RC_ASSERT(getRelativePath(base, target) == relativeByHand(base, target));
    RC_ASSERT(leadsUpward(base, target) == relativeByHand(base, target).starts_with(u".."));
}

RC_GTEST_PROP(GetRelativePath, isTheSameForPlainPathsBelowTheBase, ()) {
    auto const base = anyPath();
    auto const target = base + u"/" + anyPath();

    RC_ASSERT(getRelativePath(base, target) == relativeByHand(base, target));
    RC_ASSERT(leadsUpward(base, target) == relativeByHand(base, target).starts_with(u".."));
}

RC_GTEST_PROP(GetRelativePath, doesNotDependOnHowTheBaseSeparatesItsElements, ()) {
    auto const base = u"/" + anyPath();
    auto const target = anyPath();

    RC_ASSERT(getRelativePath(base + u"/", target) == getRelativePath(base, target));
    RC_ASSERT(getRelativePath(u"/" + base, target) == getRelativePath(base, target));
}

RC_GTEST_PROP(GetRelativePath, ofATargetOutsideAlwaysBeginsWithTwoDots, ()) {
    auto const base = anyPath();
    auto const target = anyPath();
    bool const isSame =
        cut(base).isAbsolute == cut(target).isAbsolute && cut(base).names == cut(target).names;
    RC_PRE(!isSame && !isBelowByHand(base, target));

    RC_ASSERT(getRelativePath(base, target).starts_with(u".."));
}

TEST(GetParentFolder, isThePathWithoutItsLastElement) {
    EXPECT_EQ(getParentFolder(u"/a/b"), Path(u"/a"));
    EXPECT_EQ(getParentFolder(u"/a/b/"), Path(u"/a"));
    EXPECT_EQ(getParentFolder(u"/a//b//"), Path(u"/a"));
    EXPECT_EQ(getParentFolder(u"a/b"), Path(u"a"));
    EXPECT_EQ(getParentFolder(u"/a\\b"), Path(u"/"));
    EXPECT_EQ(getParentFolder(u"/a/.."), Path(u"/a"));
}

TEST(GetParentFolder, endsAtTheRootOrTheEmptyPath) {
    EXPECT_EQ(getParentFolder(u"/a"), Path(u"/"));
    EXPECT_EQ(getParentFolder(u"/"), Path(u"/"));
    EXPECT_EQ(getParentFolder(u"//"), Path(u"/"));
    EXPECT_EQ(getParentFolder(u"//a"), Path(u"/"));
    EXPECT_EQ(getParentFolder(u"a"), Path(u""));
    EXPECT_EQ(getParentFolder(u"a/"), Path(u""));
    EXPECT_EQ(getParentFolder(u""), Path(u""));
}

RC_GTEST_PROP(GetParentFolder, leadsBackToTheTextOfAFolderAbove, ()) {
    Path const root = getParentFolder(u"/" + anyPath() + u"a/x");
    auto const below = cut(anyPath()).names;
    Path path = root / join(below);

    for (std::size_t step = 0; step < below.size(); ++step) {
        RC_ASSERT(path != root);
        path = getParentFolder(path);
    }

    RC_ASSERT(path == root);
}

TEST(IsParent, isTrueForEveryFolderAbove) {
    EXPECT_TRUE(isParent(u"/a/b/c", u"/a/b"));
    EXPECT_TRUE(isParent(u"/a/b/c", u"/a"));
    EXPECT_TRUE(isParent(u"/a/b/c", u"/"));
    EXPECT_TRUE(isParent(u"a/b", u"a"));
    EXPECT_TRUE(isParent(u"/a/b", u"/a/"));
    EXPECT_TRUE(isParent(u"/a/..b", u"/a"));
}

TEST(IsParent, isFalseForThePathItselfAndForPathsElsewhere) {
    EXPECT_FALSE(isParent(u"/a", u"/a"));
    EXPECT_FALSE(isParent(u"/a/", u"/a"));
    EXPECT_FALSE(isParent(u"/", u"/"));
    EXPECT_FALSE(isParent(u"/a", u"/a/b"));
    EXPECT_FALSE(isParent(u"/ab", u"/a"));
    EXPECT_FALSE(isParent(u"a/b", u"/a"));
    EXPECT_FALSE(isParent(u"/a", u""));
}

RC_GTEST_PROP(IsParent, isTrueIfTheElementsOfThePathBeginWithThoseOfTheFolder, ()) {
    auto const path = anyPath();
    auto const folder = anyPath();

    RC_ASSERT(isParent(path, folder) == isBelowByHand(folder, path));
}

TEST(Exists, isTrueForFilesFoldersAndAllLinks) {
    TemporaryFolder const folder;
    folder.addFile("file");
    folder.addLink("dangling", "none");
    folder.addLink("loop", "loop");

    EXPECT_TRUE(exists(folder.path()));
    EXPECT_TRUE(exists(folder.path() / u"file"));
    EXPECT_TRUE(exists(folder.path() / u"dangling"));
    EXPECT_TRUE(exists(folder.path() / u"loop"));
}

TEST(IsDirectory, isTrueForFoldersAndLinksToThem) {
    TemporaryFolder const folder;
    folder.addFolder("sub");
    folder.addLink("link", "sub");

    EXPECT_TRUE(is_directory(folder.path() / u"sub"));
    EXPECT_TRUE(is_directory(folder.path() / u"sub/"));
    EXPECT_TRUE(is_directory(folder.path() / u"link"));
}

TEST(IsDirectory, isFalseForFilesAndForLinksToThemOrToNothing) {
    TemporaryFolder const folder;
    folder.addFile("file");
    folder.addLink("link", "file");
    folder.addLink("dangling", "none");
    folder.addLink("loop", "loop");

    EXPECT_FALSE(is_directory(folder.path() / u"file"));
    EXPECT_FALSE(is_directory(folder.path() / u"link"));
    EXPECT_FALSE(is_directory(folder.path() / u"dangling"));
    EXPECT_FALSE(is_directory(folder.path() / u"loop"));
}

TEST(ExistsAndIsDirectory, areFalseForPathsThatCannotExist) {
    TemporaryFolder const folder;
    folder.addFile("file");
    auto const root = folder.path();
    for (Path const& path :
         {root / u"none", root / u"file/below", root / u"file/", root / Text(300, u'x'),
          root / Text(100'000, u'x'), root / u"\xD800", Path(root.native() + u'\0'), Path()}) {
        EXPECT_NO_THROW({
            EXPECT_FALSE(exists(path));
            EXPECT_FALSE(is_directory(path));
        });
    }
}

TEST(ExistsAndIsDirectory, findUnusualNames) {
    TemporaryFolder const folder;
    for (auto const* name : {u"with space", u"line\nbreak", u"\u05E9\u05DC\u05D5\u05DD", u"\u202Ertl",
                             u"\U0001F600", u"stray\xDCFF", u"\xDCC3(", u"back\\slash"}) {
        Path const path = folder.path() / name;
        EXPECT_FALSE(exists(path));

        folder.addFolder(toSystem(Path(name)));

        EXPECT_TRUE(exists(path));
        EXPECT_TRUE(is_directory(path));
    }
}

TEST(GenerateUUID, isARandomUuidInLowerCase) {
    for (int round = 0; round < 200; ++round) {
        auto const uuid = generateUUID();
        std::string const bytes(uuid.begin(), uuid.end());

        EXPECT_THAT(bytes, ::testing::MatchesRegex(
                               "[0-9a-f]{8}-[0-9a-f]{4}-4[0-9a-f]{3}-[89ab][0-9a-f]{3}-[0-9a-f]{12}"));
    }
}

TEST(GenerateUUID, neverReturnsTheSameTwiceOnAnyThread) {
    constexpr std::size_t threadCount = 4;
    constexpr std::size_t rounds = 2000;
    std::vector<std::vector<Text>> generated(threadCount);
    {
        std::vector<std::jthread> threads;
        for (auto& list : generated) {
            threads.emplace_back(
                [&list] { std::generate_n(std::back_inserter(list), rounds, generateUUID); });
        }
    }

    std::set<Text> different;
    for (auto const& list : generated) {
        different.insert(list.begin(), list.end());
    }

    EXPECT_EQ(different.size(), threadCount * rounds);
}

TEST(GenerateUUID, theChildOfAForkGeneratesOthersThanItsParent) {
    generateUUID();
    std::array<int, 2> ends{};
    ASSERT_EQ(::pipe(ends.data()), 0);
    auto const child = ::fork();
    if (child == 0) {
        auto const uuid = generateUUID();
        auto const size = uuid.size() * sizeof(char16_t);
        ::_exit(::write(ends[1], uuid.data(), size) == static_cast<ssize_t>(size) ? 0 : 1);
    }

    auto const ours = generateUUID();
    Text theirs(36, u' ');
    auto const size = ::read(ends[0], theirs.data(), theirs.size() * sizeof(char16_t));
    int status = -1;
    ::waitpid(child, &status, 0);
    ::close(ends[0]);
    ::close(ends[1]);

    ASSERT_EQ(status, 0);
    ASSERT_EQ(size, 72);
    EXPECT_NE(ours, theirs);
}

} // namespace project::metadata

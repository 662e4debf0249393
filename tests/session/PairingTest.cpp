#include "Pairing.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace project::session {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Evidence = Rename::Evidence;

Rename same(std::u16string const& from, std::u16string const& to) {
    return {from, to, FileKind::File, Evidence::Content, 100};
}

TEST(PairingByContent, pairsFilesWithEqualContents) {
    auto const found = pairByContent({{u"a", "1"}, {u"b", "2"}}, {{u"c", "2"}, {u"d", "1"}});

    EXPECT_THAT(found.renames.pairs, ElementsAre(same(u"a", u"d"), same(u"b", u"c")));
    EXPECT_THAT(found.gone, IsEmpty());
    EXPECT_THAT(found.added, IsEmpty());
}

TEST(PairingByContent, leavesTheOthersOver) {
    auto const found = pairByContent({{u"a", "1"}}, {{u"c", "2"}});

    EXPECT_THAT(found.renames.pairs, IsEmpty());
    EXPECT_THAT(found.renames.ambiguous, IsEmpty());
    EXPECT_EQ(found.gone.size(), 1U);
    EXPECT_EQ(found.added.size(), 1U);
}

TEST(PairingByContent, ofSeveralEqualFilesChoosesThoseWithTheSameEndOfThePath) {
    auto const found = pairByContent({{u"src/x/init", "1"}, {u"src/y/init", "1"}},
                                     {{u"lib/y/init", "1"}, {u"lib/x/init", "1"}});

    EXPECT_THAT(found.renames.pairs,
                ElementsAre(same(u"src/x/init", u"lib/x/init"), same(u"src/y/init", u"lib/y/init")));
}

TEST(PairingByContent, listsEqualFilesThatNothingDistinguishes) {
    auto const found = pairByContent({{u"a", "1"}}, {{u"c", "1"}, {u"b", "1"}});

    EXPECT_THAT(found.renames.pairs, IsEmpty());
    EXPECT_THAT(found.renames.ambiguous, ElementsAre(AmbiguousRename{{u"a"}, {u"b", u"c"}}));
}

TEST(PairingByContent, listsFilesThatAreEquallyNear) {
    auto const found = pairByContent({{u"a/f", "1"}}, {{u"c/f", "1"}, {u"b/f", "1"}});

    EXPECT_THAT(found.renames.ambiguous, ElementsAre(AmbiguousRename{{u"a/f"}, {u"b/f", u"c/f"}}));
}

TEST(PairingByContent, pairsEmptyFilesOfOneNameOnly) {
    auto const found =
        pairByContent({{u"a/f", "0", true}, {u"g", "0", true}}, {{u"b/f", "0", true}, {u"h", "0", true}});

    EXPECT_THAT(found.renames.pairs, ElementsAre(same(u"a/f", u"b/f")));
    EXPECT_THAT(found.renames.ambiguous, IsEmpty());
}

Rename similar(std::u16string const& from, std::u16string const& to, int similarity) {
    return {from, to, FileKind::File, Evidence::Similarity, similarity};
}

TEST(PairingBySimilarity, choosesTheMostSimilarFiles) {
    auto const found = pairBySimilarity({{u"a", "1"}, {u"b", "2"}}, {{u"c", "3"}, {u"d", "4"}},
                                        {{0, 0, 6000}, {0, 1, 9000}, {1, 0, 5500}, {1, 1, 8000}}, 50);

    EXPECT_THAT(found.pairs, ElementsAre(similar(u"a", u"d", 90), similar(u"b", u"c", 55)));
    EXPECT_THAT(found.ambiguous, IsEmpty());
}

TEST(PairingBySimilarity, prefersTheSameNameIfItIsUniqueAndTheContentsAreSimilarEnough) {
    std::vector<FileContentId> const gone{{u"src/a", "1"}};
    std::vector<FileContentId> const added{{u"lib/a", "2"}, {u"lib/b", "3"}};

    EXPECT_THAT(pairBySimilarity(gone, added, {{0, 0, 6000}, {0, 1, 9000}}, 50).pairs,
                ElementsAre(similar(u"src/a", u"lib/b", 90)));
    EXPECT_THAT(pairBySimilarity({{u"src/a", "1"}, {u"src/b", "4"}}, added,
                                 {{0, 0, 7500}, {0, 1, 9000}, {1, 1, 9500}}, 50)
                    .pairs,
                ElementsAre(similar(u"src/a", u"lib/a", 75), similar(u"src/b", u"lib/b", 95)));
}

TEST(PairingBySimilarity, prefersTheSameNameAmongEquallySimilarFilesIfNothingIsLeftOver) {
    auto const found = pairBySimilarity({{u"x/a", "1"}, {u"x/b", "2"}}, {{u"y/b", "3"}, {u"y/a", "4"}},
                                        {{0, 0, 6000}, {1, 0, 6000}, {0, 1, 6000}, {1, 1, 6000}}, 50);

    EXPECT_THAT(found.pairs, ElementsAre(similar(u"x/a", u"y/a", 60), similar(u"x/b", u"y/b", 60)));
}

TEST(PairingBySimilarity, isAmbiguousWhereAFileThatIsLeftOverIsAsSimilar) {
    auto const added =
        pairBySimilarity({{u"a", "1"}}, {{u"b", "2"}, {u"c", "3"}}, {{0, 0, 9050}, {0, 1, 9000}}, 50);
    EXPECT_THAT(added.pairs, IsEmpty());
    EXPECT_THAT(added.ambiguous, ElementsAre(AmbiguousRename{{u"a"}, {u"b", u"c"}}));

    auto const gone =
        pairBySimilarity({{u"a", "1"}, {u"b", "2"}}, {{u"c", "3"}}, {{0, 0, 9000}, {1, 0, 9000}}, 50);
    EXPECT_THAT(gone.pairs, IsEmpty());
    EXPECT_THAT(gone.ambiguous, ElementsAre(AmbiguousRename{{u"a", u"b"}, {u"c"}}));

    EXPECT_THAT(
        pairBySimilarity({{u"a", "1"}}, {{u"b", "2"}, {u"c", "3"}}, {{0, 0, 9000}, {0, 1, 8900}}, 50).pairs,
        ElementsAre(similar(u"a", u"b", 90)));
}

TEST(PairingByName, guessesWhereANameIsUnique) {
    auto const found = pairByName({u"a/f", u"a/g", u"b/g"}, {u"c/g", u"c/f", u"c/h"});

    EXPECT_THAT(found.pairs, ElementsAre(Rename{u"a/f", u"c/f", FileKind::File, Evidence::Name, 0}));
    EXPECT_THAT(found.ambiguous, ElementsAre(AmbiguousRename{{u"a/g", u"b/g"}, {u"c/g"}}));
}

class PairingOfFolders : public ::testing::Test {
protected:
    std::vector<std::u16string> foldersAfter(std::vector<Rename> pairs, std::u16string const& listed = {}) {
        RenamesFound renames{std::move(pairs), {}};
        pairFolders(renames, {u"src", u"src/io"}, [&](std::u16string const& path) { return path == listed; });
        std::vector<std::u16string> result;
        for (auto const& pair : renames.pairs) {
            if (pair.kind == FileKind::Folder) {
                result.push_back(pair.from + u" " + pair.to);
            }
        }
        return result;
    }
};

TEST_F(PairingOfFolders, followsTheFilesIfTheyAgree) {
    EXPECT_THAT(foldersAfter({same(u"src/a", u"lib/a"), same(u"src/io/b", u"lib/io/b")}),
                ElementsAre(u"src lib", u"src/io lib/io"));
    EXPECT_THAT(foldersAfter({same(u"src/a", u"lib/a"), same(u"src/io/b", u"other/b")}),
                ElementsAre(u"src/io other"));
    EXPECT_THAT(foldersAfter({same(u"src/a", u"lib/b")}), IsEmpty());
    EXPECT_THAT(foldersAfter({same(u"src/a", u"a")}), IsEmpty());
    EXPECT_THAT(foldersAfter({same(u"src.txt", u"lib.txt")}), IsEmpty());
}

TEST_F(PairingOfFolders, isAGuessIfTheFilesAre) {
    RenamesFound renames{{same(u"src/a", u"lib/a"), {u"src/b", u"lib/b", FileKind::File, Evidence::Name, 0}},
                         {}};

    pairFolders(renames, {u"src"}, [](std::u16string const&) { return false; });

    EXPECT_EQ(renames.pairs.front(), (Rename{u"src", u"lib", FileKind::Folder, Evidence::Name, 0}));
}

TEST_F(PairingOfFolders, leavesAFolderThatWouldTakeThePlaceOfAnother) {
    EXPECT_THAT(foldersAfter({same(u"src/a", u"lib/a")}, u"lib"), IsEmpty());
}

} // namespace
} // namespace project::session

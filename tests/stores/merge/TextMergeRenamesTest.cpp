// Merges in which files were renamed.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "stores/merge/MergeSamples.hpp"

namespace project::stores {
namespace {

using namespace samples;
using ::testing::HasSubstr;
using ::testing::Not;

/// A file with labels of one category.
Node labelled(std::initializer_list<char16_t const*> labels) {
    Nested category{u"Category", {{u"UUID", u"c"}}, {}};
    for (auto const* label : labels) {
        category.nested.push_back({u"Label", {{u"UUID", label}}, {}});
    }
    return makeNode(u"Info", {}, {category});
}

Address markerOf(char16_t const* folder) {
    return fileAddress(folder).child({u"DIR_SIGNIFIER", u"1"});
}

Batch folder(char16_t const* path) {
    return {set(fileAddress(path)), set(markerOf(path))};
}

std::string text(std::initializer_list<Batch> parts) {
    Batch all;
    for (auto const& part : parts) {
        all.insert(all.end(), part.begin(), part.end());
    }
    return textWith(all);
}

Change entryPoint(char16_t const* file, char16_t const* name = u"run") {
    return set(addressOf({u"EntryPoints", u"Root", u"EntryPoint", u"1"}),
               makeNode(u"Info", {{u"File", file}, {u"Name", name}}));
}

/// The merged text, which must be the same with the sides exchanged; or the conflicts.
std::string mergedBothWays(std::string const& base, std::string const& ours, std::string const& theirs,
                           SideRenames const& ourRenames, SideRenames const& theirRenames = {}) {
    auto const merge = mergeTexts(base, ours, theirs, ourRenames, theirRenames);
    auto const exchanged = mergeTexts(base, theirs, ours, theirRenames, ourRenames);
    EXPECT_EQ(merge.conflicts().size(), exchanged.conflicts().size());
    if (!merge.conflicts().empty()) {
        return described(merge.conflicts());
    }
    EXPECT_EQ(merge.text(), exchanged.text());
    return merge.text();
}

SideRenames renames(SideRenames::Paths renamed, SideRenames::Paths relocated = {}) {
    return {std::move(renamed), std::move(relocated)};
}

TEST(TextMergeRenames, putALabelOfTheOtherSideOnTheRenamedFile) {
    auto const base = text({folder(u"src"), {set(fileAddress(u"src/main.cpp"))}});
    auto const ours = text({folder(u"lib"), {set(fileAddress(u"lib/main.cpp"))}});
    auto const theirs = text({folder(u"src"), {set(fileAddress(u"src/main.cpp"), labelled({u"open"}))}});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"src/main.cpp", u"lib/main.cpp"}})),
              text({folder(u"lib"), {set(fileAddress(u"lib/main.cpp"), labelled({u"open"}))}}));
}

TEST(TextMergeRenames, thatSourceControlDoesNotKnowConflictAsBefore) {
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const ours = textWith({set(fileAddress(u"b"))});
    auto const theirs = textWith({set(fileAddress(u"a"), labelled({u"open"}))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, {}), R"(Subtree at a, removed by ours, changed a)");
    EXPECT_EQ(mergedBothWays(base, ours, theirs, {}), described(mergeTexts(base, ours, theirs).conflicts()));
}

TEST(TextMergeRenames, thatTheTextOfTheSideDoesNotShowAreNotFollowed) {
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const ours = textWith({set(fileAddress(u"a")), set(fileAddress(u"c"))});
    auto const theirs = textWith({set(fileAddress(u"a"), labelled({u"open"}))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"b"}})),
              textWith({set(fileAddress(u"a"), labelled({u"open"})), set(fileAddress(u"c"))}));
}

TEST(TextMergeRenames, moveDataInOtherScopesAndBelowTheFile) {
    auto const inScope = [](char16_t const* path) { return addressOf({u"Files", u"Notes", u"File", path}); };
    auto const data = [](char16_t const* path) { return fileAddress(path).child({u"LabelData", u"Data"}); };
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const ours = textWith({set(fileAddress(u"b"))});
    auto const theirs = textWith(
        {set(fileAddress(u"a")), set(data(u"a")), set(inScope(u"a"), makeNode(u"x", {{u"k", u"v"}}))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"b"}})),
              textWith({set(fileAddress(u"b")), set(data(u"b")),
                        set(inScope(u"b"), makeNode(u"x", {{u"k", u"v"}}))}));
}

TEST(TextMergeRenames, reachEntryPointsThatTheOtherSideSetsOrChanges) {
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const withEntry = textWith({set(fileAddress(u"a")), entryPoint(u"a")});

    EXPECT_EQ(mergedBothWays(base, textWith({set(fileAddress(u"b"))}), withEntry, renames({{u"a", u"b"}})),
              textWith({set(fileAddress(u"b")), entryPoint(u"b")}));
    EXPECT_EQ(mergedBothWays(withEntry, textWith({set(fileAddress(u"b")), entryPoint(u"b")}),
                             textWith({set(fileAddress(u"a")), entryPoint(u"a", u"start")}),
                             renames({{u"a", u"b"}})),
              textWith({set(fileAddress(u"b")), entryPoint(u"b", u"start")}));
}

TEST(TextMergeRenames, ofAFolderReachThePathAndTheLabelsOfTheFolder) {
    auto const path = [](char16_t const* folder) {
        return set(addressOf({u"ProjectPath", u"Root", u"Reference", u"1"}),
                   makeNode(u"Info", {{u"Ref", folder}, {u"Type", u"Relative"}}));
    };
    auto const base = text({folder(u"src"), {set(fileAddress(u"src/a"))}});
    auto const ours = text({folder(u"lib"), {set(fileAddress(u"lib/a"))}});
    auto const theirs =
        text({folder(u"src"),
              {set(fileAddress(u"src"), labelled({u"open"})), set(fileAddress(u"src/a")), path(u"src")}});

    EXPECT_EQ(
        mergedBothWays(base, ours, theirs, renames({{u"src/a", u"lib/a"}})),
        text({folder(u"lib"),
              {set(fileAddress(u"lib"), labelled({u"open"})), set(fileAddress(u"lib/a")), path(u"lib")}}));
}

TEST(TextMergeRenames, putAFileThatTheOtherSideAddedWhereTheMergeOfTheFilesPutsIt) {
    auto const base = text({folder(u"src"), {set(fileAddress(u"src/a"))}});
    auto const ours = text({folder(u"lib"), {set(fileAddress(u"lib/a"))}});
    auto const theirs = text(
        {folder(u"src"), {set(fileAddress(u"src/a")), set(fileAddress(u"src/new"), labelled({u"open"}))}});
    auto const ourRenames = renames({{u"src/a", u"lib/a"}});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, ourRenames, renames({}, {{u"src/new", u"lib/new"}})),
              text({folder(u"lib"),
                    {set(fileAddress(u"lib/a")), set(fileAddress(u"lib/new"), labelled({u"open"}))}}));
    EXPECT_EQ(mergedBothWays(base, ours, theirs, ourRenames),
              text({folder(u"lib"),
                    folder(u"src"),
                    {set(fileAddress(u"lib/a")), set(fileAddress(u"src/new"), labelled({u"open"}))}}));
}

TEST(TextMergeRenames, putAFileThatOneSideRenamedIntoAFolderThatTheOtherRenamedAtItsLastPlace) {
    auto const base = text({folder(u"src"), {set(fileAddress(u"a")), set(fileAddress(u"src/b"))}});
    auto const ours = text({folder(u"lib"), {set(fileAddress(u"a")), set(fileAddress(u"lib/b"))}});
    auto const theirs =
        text({folder(u"src"), {set(fileAddress(u"src/a"), labelled({u"open"})), set(fileAddress(u"src/b"))}});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"src/b", u"lib/b"}}),
                             renames({{u"a", u"src/a"}}, {{u"src/a", u"lib/a"}})),
              text({folder(u"lib"),
                    {set(fileAddress(u"lib/a"), labelled({u"open"})), set(fileAddress(u"lib/b"))}}));
}

TEST(TextMergeRenames, ofBothSidesToOnePathAreOneRename) {
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const ours = textWith({set(fileAddress(u"b"), labelled({u"open"}))});
    auto const theirs = textWith({set(fileAddress(u"b"), labelled({u"done"}))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"b"}}), renames({{u"a", u"b"}})),
              textWith({set(fileAddress(u"b"), labelled({u"done", u"open"}))}));
}

TEST(TextMergeRenames, ofBothSidesToTwoPathsKeepBothFiles) {
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const ours = textWith({set(fileAddress(u"b"), labelled({u"open"}))});
    auto const theirs = textWith({set(fileAddress(u"c"), labelled({u"done"}))});

    EXPECT_EQ(
        mergedBothWays(base, ours, theirs, renames({{u"a", u"b"}}), renames({{u"a", u"c"}})),
        textWith({set(fileAddress(u"b"), labelled({u"open"})), set(fileAddress(u"c"), labelled({u"done"}))}));
}

TEST(TextMergeRenames, ofTwoFilesToOnePathJoinTheirLabels) {
    auto const base = textWith({set(fileAddress(u"a")), set(fileAddress(u"b"))});
    auto const ours = textWith({set(fileAddress(u"b")), set(fileAddress(u"c"), labelled({u"open"}))});
    auto const theirs = textWith({set(fileAddress(u"a")), set(fileAddress(u"c"), labelled({u"done"}))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"c"}}), renames({{u"b", u"c"}})),
              textWith({set(fileAddress(u"c"), labelled({u"done", u"open"}))}));
}

TEST(TextMergeRenames, ontoAFileThatTheOtherSideAddedAreNotFollowed) {
    auto const base = textWith({set(fileAddress(u"a"))});
    auto const ours = textWith({set(fileAddress(u"b"))});
    auto const theirs =
        textWith({set(fileAddress(u"a"), labelled({u"open"})), set(fileAddress(u"b"), labelled({u"done"}))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"b"}})),
              "Subtree at a, removed by ours, changed a");
}

TEST(TextMergeRenames, ofAFileThatTheOtherSideRemovedKeepIt) {
    auto const base = textWith({set(fileAddress(u"a"), labelled({u"open"})), set(fileAddress(u"x"))});
    auto const ours = textWith({set(fileAddress(u"b"), labelled({u"open"})), set(fileAddress(u"x"))});
    auto const theirs = textWith({set(fileAddress(u"x"))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"b"}})), ours);
}

TEST(TextMergeRenames, exchangeTwoFilesThatTheOtherSideLabels) {
    auto const base = textWith({set(fileAddress(u"a")), set(fileAddress(u"b"))});
    auto const ours = textWith({set(fileAddress(u"c")), set(fileAddress(u"b"), labelled({u"moved"}))});
    auto const theirs = textWith({set(fileAddress(u"a"), labelled({u"open"})), set(fileAddress(u"b"))});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"a", u"c"}})),
              textWith({set(fileAddress(u"c"), labelled({u"open"})),
                        set(fileAddress(u"b"), labelled({u"moved"}))}));
}

TEST(TextMergeRenames, ofAFolderTakeAlongFilesThatSourceControlDoesNotKnow) {
    auto const base =
        text({folder(u"src"), folder(u"src/none"), {set(fileAddress(u"src/a")), set(fileAddress(u"src/o"))}});
    auto const ours =
        text({folder(u"lib"), folder(u"lib/none"), {set(fileAddress(u"lib/a")), set(fileAddress(u"lib/o"))}});
    auto const theirs = text({folder(u"src"),
                              folder(u"src/none"),
                              {set(fileAddress(u"src/a")), set(fileAddress(u"src/o"), labelled({u"open"})),
                               set(fileAddress(u"src/none"), labelled({u"done"}))}});

    EXPECT_EQ(mergedBothWays(base, ours, theirs, renames({{u"src/a", u"lib/a"}})),
              text({folder(u"lib"),
                    folder(u"lib/none"),
                    {set(fileAddress(u"lib/a")), set(fileAddress(u"lib/o"), labelled({u"open"})),
                     set(fileAddress(u"lib/none"), labelled({u"done"}))}}));
}

TEST(TextMergeRenames, leaveMarkersAroundOtherConflictsOnly) {
    auto const name = [](char16_t const* text) {
        return set(addressOf({u"Info", u"ProjectData"}), makeNode(u"", {{u"Name", text}}));
    };
    auto const base = textWith({set(fileAddress(u"a")), name(u"1")});
    auto const ours = textWith({set(fileAddress(u"b")), name(u"2")});
    auto const theirs = textWith({set(fileAddress(u"a"), labelled({u"open"})), name(u"3")});

    auto const merge = mergeTexts(base, ours, theirs, renames({{u"a", u"b"}}), {});

    EXPECT_EQ(described(merge.conflicts()), R"(Key Name at "Info","ProjectData")");
    EXPECT_THAT(merge.textWithMarkers(), HasSubstr(R"({"file":"b","children":[)"));
    EXPECT_THAT(merge.textWithMarkers(), Not(HasSubstr("\"a\"")));
}

} // namespace
} // namespace project::stores

#include "project/stores/DefinitionChange.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/stores/StoreError.hpp"
#include "stores/merge/MergeSamples.hpp"

namespace project::stores {
namespace {

using namespace samples;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Renames = std::map<std::u16string, std::u16string>;

/// "renamed folder lib from src", "added label Status=Open a.cpp", with the settings that changed.
std::string described(DefinitionChange const& change) {
    constexpr char const* subjects[] = {"name",  "description", "file",  "filelabel", "data",      "category",
                                        "label", "entry",       "group", "path",      "reference", "other"};
    constexpr char const* kinds[] = {"added", "removed", "renamed", "changed"};
    std::string result = kinds[static_cast<int>(change.kind)] + std::string(" ") +
                         (change.isFolder ? "folder" : subjects[static_cast<int>(change.subject)]) + ' ';
    result += change.category.empty() ? "" : toAscii(change.category + u'=' + change.label) + ' ';
    result += toAscii(change.name);
    result += change.earlier.empty() ? "" : " from " + toAscii(change.earlier);
    result += change.isWithFolder ? " with its folder" : "";
    for (auto const& value : change.values) {
        result += ' ' + toAscii(value.key + u':' + value.before + u"->" + value.after);
    }
    return result;
}

std::vector<std::string> changes(std::string const& before, std::string const& after,
                                 Renames const& renames = {}) {
    std::vector<std::string> result;
    for (auto const& change : changesBetween(before, after, renames)) {
        result.push_back(described(change));
    }
    return result;
}

Address markerOf(char16_t const* folder) {
    return fileAddress(folder).child({u"DIR_SIGNIFIER", u"1"});
}

Node labelled(char16_t const* label, char16_t const* value = u"") {
    return makeNode(
        u"Info", {},
        {{u"Category", {{u"UUID", u"c"}}, {{u"Label", {{u"UUID", label}, {u"Value", value}}, {}}}}});
}

Batch categories() {
    return {set(addressOf({u"Categories", u"Root", u"Category", u"c"}),
                makeNode(u"Info", {{u"Name", u"Status"}})),
            set(addressOf({u"Categories", u"Root", u"Category", u"c", u"Label", u"1"}),
                makeNode(u"Info", {{u"Name", u"Open"}})),
            set(addressOf({u"Categories", u"Root", u"Category", u"c", u"Label", u"2"}),
                makeNode(u"Info", {{u"Name", u"Done"}}))};
}

std::string withCategories(Batch batch) {
    auto all = categories();
    all.insert(all.end(), batch.begin(), batch.end());
    return textWith(all);
}

TEST(DefinitionChange, reportsNothingBetweenEqualDefinitions) {
    auto const text = withCategories({set(fileAddress(u"a"), labelled(u"1"))});

    EXPECT_THAT(changes(text, text), IsEmpty());
    EXPECT_THAT(changes("", ""), IsEmpty());
}

TEST(DefinitionChange, reportsFilesAndFolders) {
    auto const before = textWith({set(fileAddress(u"a")), set(fileAddress(u"old")), set(markerOf(u"old"))});
    auto const after = textWith({set(fileAddress(u"b")), set(fileAddress(u"new")), set(markerOf(u"new"))});

    EXPECT_THAT(changes(before, after),
                ElementsAre("removed file a", "added file b", "added folder new", "removed folder old"));
}

TEST(DefinitionChange, reportsLabelsOnFilesByName) {
    auto const before = withCategories({set(fileAddress(u"a"), labelled(u"1"))});
    auto const after = withCategories({set(fileAddress(u"a"), labelled(u"2"))});

    EXPECT_THAT(changes(before, after),
                ElementsAre("removed filelabel Status=Open a", "added filelabel Status=Done a"));
    EXPECT_THAT(changes(before, withCategories({set(fileAddress(u"a"), labelled(u"1", u"x"))})),
                ElementsAre("changed filelabel Status=Open a Value:->x"));
}

TEST(DefinitionChange, namesALabelThatWasDeletedAtTheSameTime) {
    auto const before = withCategories({set(fileAddress(u"a"), labelled(u"1"))});

    EXPECT_THAT(changes(before, textWith({set(fileAddress(u"a"))})),
                ElementsAre("removed filelabel Status=Open a", "removed category Status"));
}

TEST(DefinitionChange, doesNotListTheLabelsOfARemovedFile) {
    EXPECT_THAT(changes(withCategories({set(fileAddress(u"a"), labelled(u"1"))}), withCategories({})),
                ElementsAre("removed file a"));
}

TEST(DefinitionChange, reportsCategoriesAndLabels) {
    auto const label = [](char16_t const* name) {
        return set(addressOf({u"Categories", u"Root", u"Category", u"c", u"Label", u"1"}),
                   makeNode(u"Info", {{u"Name", name}}));
    };
    auto const before = withCategories({});
    auto const after = withCategories(
        {label(u"Begun"), remove(addressOf({u"Categories", u"Root", u"Category", u"c", u"Label", u"2"})),
         set(addressOf({u"Categories", u"Root", u"Category", u"c"}),
             makeNode(u"Info", {{u"Name", u"State"}, {u"SingleValued", u"1"}}))});

    EXPECT_THAT(changes(before, after),
                ElementsAre("renamed category State from Status SingleValued:->1",
                            "renamed label State= Begun from Open", "removed label State= Done"));
}

TEST(DefinitionChange, reportsEntryPointsWithTheirSettings) {
    auto const group = set(addressOf({u"EntryPointGroups", u"Root", u"EntryPointGroup", u"g"}),
                           makeNode(u"Info", {{u"Name", u"Night"}}));
    auto const entry = [](Keys const& keys) {
        return set(addressOf({u"EntryPoints", u"Root", u"EntryPoint", u"1"}),
                   makeNode(u"Info", keys, {{u"Extension", {{u"Name", u"k"}, {u"Value", u"v"}}, {}}}));
    };
    auto const before =
        textWith({group, set(fileAddress(u"a")), entry({{u"File", u"a"}, {u"Type", u"Basic"}})});
    auto const after =
        textWith({group, set(fileAddress(u"a")), entry({{u"File", u"a"}, {u"GroupUUID", u"g"}})});

    EXPECT_THAT(changes(before, after), ElementsAre("changed entry a GroupUUID:->Night Type:Basic->"));
    EXPECT_THAT(changes("", before),
                ElementsAre("added file a", "added entry a Type:->Basic k:->v", "added group Night"));
}

TEST(DefinitionChange, reportsSettingsAndReferences) {
    auto const name = [](char16_t const* text) {
        return set(addressOf({u"Info", u"ProjectData"}), makeNode(u"", {{u"Name", text}}));
    };
    auto const reference = [](char16_t const* head, char16_t const* path) {
        return set(addressOf({head, u"Root", u"Reference", u"1"}),
                   makeNode(u"Info", {{u"Ref", path}, {u"Type", u"Relative"}}));
    };
    auto const before = textWith({name(u"X"), reference(u"ProjectPath", u"lib")});
    auto const after = textWith({name(u"Y"), reference(u"References", u"../q"),
                                 set(addressOf({u"Root", u"Extensions", u"Extension", u"Information"}),
                                     makeNode(u"", {{u"description", u"d"}})),
                                 set(addressOf({u"Custom", u"1"}))});

    EXPECT_THAT(changes(before, after),
                ElementsAre("changed name Y from X Name:X->Y", "changed description d description:->d",
                            "removed path lib", "added reference ../q Type:->Relative",
                            "added other Custom 1"));
}

TEST(DefinitionChange, reportsDataOfFiles) {
    auto const data = [](char16_t const* value) {
        return set(fileAddress(u"a").child({u"LabelData", u"Data"}),
                   makeNode(u"Info", {}, {{u"Record", {{u"UUID", u"1"}, {u"Value", value}}, {}}}));
    };
    auto const note = set(addressOf({u"Files", u"Notes", u"File", u"a"}), makeNode(u"x", {{u"k", u"v"}}));
    auto const before = textWith({set(fileAddress(u"a")), data(u"1")});
    auto const after = textWith({set(fileAddress(u"a")), data(u"2"), note});

    EXPECT_THAT(changes(before, after),
                ElementsAre("added data Notes= a k:->v", "changed data LabelData Data= a 1:1->2"));
    EXPECT_THAT(changes(after, ""), ElementsAre("removed file a"));
}

TEST(DefinitionChange, followsARenamedFileToItsOtherChanges) {
    auto const entry = [](char16_t const* file) {
        return set(addressOf({u"EntryPoints", u"Root", u"EntryPoint", u"1"}),
                   makeNode(u"Info", {{u"File", file}}));
    };
    auto const before = withCategories({set(fileAddress(u"a")), entry(u"a")});
    auto const after = withCategories({set(fileAddress(u"b"), labelled(u"1")), entry(u"b")});

    EXPECT_THAT(changes(before, after, {{u"a", u"b"}}),
                ElementsAre("renamed file b from a", "added filelabel Status=Open b"));
    EXPECT_THAT(changes(before, after),
                ElementsAre("removed file a", "added file b", "added filelabel Status=Open b",
                            "renamed entry b from a"));
}

TEST(DefinitionChange, reportsARenamedFolderWithWhatMovedAlong) {
    auto const folder = [](char16_t const* name) {
        return Batch{set(fileAddress(name)), set(markerOf(name)),
                     set(fileAddress(std::u16string(name) + u"/a")),
                     set(fileAddress(std::u16string(name) + u"/b"))};
    };

    EXPECT_THAT(changes(textWith(folder(u"src")), textWith(folder(u"lib")),
                        {{u"src/a", u"lib/a"}, {u"src/b", u"lib/b"}}),
                ElementsAre("renamed folder lib from src", "renamed file lib/a from src/a with its folder",
                            "renamed file lib/b from src/b with its folder"));
}

TEST(DefinitionChange, reportsTheFolderIntoWhichAFileWasRenamed) {
    auto const before = textWith({set(fileAddress(u"a"))});
    auto const after =
        textWith({set(fileAddress(u"lib/a")), set(fileAddress(u"lib")), set(markerOf(u"lib"))});

    EXPECT_THAT(changes(before, after, {{u"a", u"lib/a"}}),
                ElementsAre("renamed file lib/a from a", "added folder lib"));
}

TEST(DefinitionChange, refusesAnIncompleteText) {
    EXPECT_THROW(changes("{\"format\"", ""), StoreError);
}

} // namespace
} // namespace project::stores

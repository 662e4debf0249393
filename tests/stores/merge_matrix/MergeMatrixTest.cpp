// Every pair of changes, made on two branches through the managers and merged, against both made in one
// project.
#include <algorithm>
#include <cctype>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/labels/Label.hpp"
#include "project/stores/TextMerge.hpp"
#include "stores/MergeSamples.hpp"
#include "stores/merge_matrix/ProjectChanges.hpp"

namespace project::test {

using namespace stores::samples;
using stores::Address;
using stores::MergeSide;
using stores::mergeTexts;
using stores::ProjectText;

namespace {

struct Conflict {
    char const* ours;
    char const* theirs;
    char const* told;
};

constexpr char const* kindAddress = R"("Categories","Root","Category","c-kind")";

/// The pairs that exclude each other. All others merge clean.
std::vector<Conflict> const& conflicts() {
    static std::string const deleted =
        std::string("Subtree at ") + kindAddress + ", removed by ours, changed ";
    static std::string const renamed = deleted + kindAddress;
    static std::string const made = deleted + R"("Categories","Root","Category","c-kind","Label","l-docs")";
    static std::string const entry =
        R"(Subtree at "EntryPoints","Root","EntryPoint","e-main", removed by ours, )"
        R"(changed "EntryPoints","Root","EntryPoint","e-main")";
    static std::string const group =
        R"(Subtree at "EntryPointGroups","Root","EntryPointGroup","g-tools", removed by ours, )"
        R"(changed "EntryPointGroups","Root","EntryPointGroup","g-tools")";
    static std::string const names = std::string("Key Name at ") + kindAddress;
    static std::vector<Conflict> const all{
        {"remove src", "add src/new.cpp", "Subtree at src, removed by ours, changed src/new.cpp"},
        {"remove src", "label src Source", "Subtree at src, removed by ours, changed src"},
        {"remove src", "label src/one.cpp Test", "Subtree at src, removed by ours, changed src/one.cpp"},
        {"remove src", "label src/two.cpp Final", "Subtree at src, removed by ours, changed src/two.cpp"},
        {"remove src/one.cpp", "label src/one.cpp Test",
         "Subtree at src/one.cpp, removed by ours, changed src/one.cpp"},
        {"delete category Kind", "rename category Kind to Sort", renamed.c_str()},
        {"delete category Kind", "rename category Kind to Art", renamed.c_str()},
        {"delete category Kind", "create label Docs", made.c_str()},
        {"rename category Kind to Sort", "rename category Kind to Art", names.c_str()},
        {"remove entry point main.cpp", "rename entry point main.cpp", entry.c_str()},
        {"remove entry point main.cpp", "extend entry point main.cpp", entry.c_str()},
        {"remove entry point main.cpp", "move entry point main.cpp to tests", entry.c_str()},
        {"delete group tools", "rename group tools", group.c_str()},
        {"name it Station", "name it Works", R"(Key Name at "Info","ProjectData")"},
    };
    return all;
}

/// Changes that come to something else than their merge when they are made in this order in one project: the
/// later one reaches what the earlier one made. All other orders that the managers allow come to the merge.
std::set<std::pair<std::string, std::string>> const reaching{
    {"label src Source", "add src/new.cpp"}, // adding drops the labels of the folders above
    // A label on a file whose category or label is gone, which `check` names:
    {"label src/one.cpp Test", "delete category Kind"},
    {"label other.cpp Test", "delete category Kind"},
    {"label src Source", "delete category Kind"},
    {"label src Source", "delete label Source"},
    // An entry point in a group that is gone, which reads as one of the default group:
    {"delete group tools", "rename entry point main.cpp"},
    {"delete group tools", "extend entry point main.cpp"},
    // An entry point of a file that is gone, which `check` names; the other order is refused:
    {"set entry point src/two.cpp", "remove src"},
};

std::string sortedTold(metadata::MetadataNode const& node) {
    std::string result = toldAscii(node.getType());
    for (std::u16string const& key : node.getKeys()) {
        result += ' ' + toldAscii(key) + '=' + toldAscii(node.get(key));
    }
    std::multiset<std::string> children;
    for (auto const& child : node.getChildren()) {
        children.insert(sortedTold(*child));
    }
    for (auto const& child : children) {
        result += '(' + child + ')';
    }
    return result;
}

void collect(ProjectText const& text, Address const& parent, std::string& content) {
    for (auto const& child : text.children(parent)) {
        Address const address = parent.child(child.element);
        if (child.node || child.made) {
            content += stores::AddressText(address).view().text;
            content += ": " + (child.node ? sortedTold(*child.node) : "made") + '\n';
        }
        collect(text, address, content);
    }
}

/// What a text says, whatever the order of nested nodes, an address a line.
std::string contentOf(std::string const& text) {
    std::string content;
    collect(readWhole(text), Address::root(), content);
    return content;
}

std::string exchanged(std::string told) {
    for (auto at = told.find("removed by ours"); at != told.npos; at = told.find("removed by ours", at)) {
        told.replace(at, std::string("removed by ours").size(), "removed by theirs");
    }
    return told;
}

/// One change, against all others.
class MergeMatrix : public testing::TestWithParam<NamedChange> {
protected:
    static std::string expectedConflict(std::string const& ours, std::string const& theirs) {
        for (auto const& conflict : conflicts()) {
            if (conflict.ours == ours && conflict.theirs == theirs) {
                return conflict.told;
            }
            if (conflict.ours == theirs && conflict.theirs == ours) {
                return exchanged(conflict.told);
            }
        }
        return {};
    }

    /// @return whether the managers allow this order.
    bool compareWith(std::string const& merged, NamedChange const& first, NamedChange const& second) const {
        auto const model = project.afterIfAllowed(project.after(common, first.make), second.make);
        if (model && reaching.contains({first.name, second.name})) {
            EXPECT_NE(contentOf(merged), contentOf(*model));
        } else if (model) {
            EXPECT_EQ(contentOf(merged), contentOf(*model)) << "after: " << first.name;
        }
        return model.has_value();
    }

    void expectMerged(std::string const& ours, std::string const& theirs, NamedChange const& other) const {
        auto const merge = mergeTexts(common, ours, theirs);
        auto const expected = expectedConflict(GetParam().name, other.name);
        ASSERT_EQ(told(merge.conflicts()), expected);
        if (expected.empty()) {
            bool const allowed = compareWith(merge.text(), GetParam(), other);
            EXPECT_TRUE(compareWith(merge.text(), other, GetParam()) || allowed);
        }
    }

    SampleProject project;
    std::string common = project.after({}, makeCommonProject);
};

TEST_P(MergeMatrix, mergesWithAnyOther) {
    auto const ours = project.after(common, GetParam().make);
    ASSERT_NE(contentOf(ours), contentOf(common));
    for (auto const& other : projectChanges()) {
        SCOPED_TRACE(other.name);
        auto const theirs = project.after(common, other.make);
        if (other.name == GetParam().name) {
            EXPECT_EQ(mergeTexts(common, ours, theirs).text(), mergeTexts(common, ours, common).text());
        } else {
            expectMerged(ours, theirs, other);
        }
    }
}

TEST_P(MergeMatrix, mergesTheSameFromVersionsWithTails) {
    auto const ours = project.after(common, GetParam().make);
    auto const oursWithTail = project.after(common, GetParam().make, Writing::Appending);
    ASSERT_NE(ours, oursWithTail);
    for (auto const& other : projectChanges()) {
        SCOPED_TRACE(other.name);
        auto const theirs = project.after(common, other.make, Writing::Appending);
        auto const merge = mergeTexts(common, ours, theirs);
        auto const withTail = mergeTexts(common, oursWithTail, theirs);
        EXPECT_EQ(merge.textWithMarkers(), withTail.textWithMarkers());
        EXPECT_EQ(told(merge.conflicts()), told(withTail.conflicts()));
        EXPECT_TRUE(readWhole(withTail.text({merge.conflicts().size(), MergeSide::Ours})).isTidy());
    }
}

TEST(MergeMatrixTables, speakOfChangesThatThereAre) {
    std::set<std::string> names;
    for (auto const& change : projectChanges()) {
        EXPECT_TRUE(names.insert(change.name).second) << change.name;
    }
    for (auto const& conflict : conflicts()) {
        EXPECT_TRUE(names.contains(conflict.ours) && names.contains(conflict.theirs)) << conflict.ours;
    }
    for (auto const& [first, second] : reaching) {
        EXPECT_TRUE(names.contains(first) && names.contains(second)) << first;
    }
}

std::string testName(testing::TestParamInfo<NamedChange> const& info) {
    std::string name = info.param.name;
    std::replace_if(
        name.begin(), name.end(), [](unsigned char unit) { return std::isalnum(unit) == 0; }, '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(Changes, MergeMatrix, testing::ValuesIn(projectChanges()), testName);

/// Projects that both sides have just made, without a common version.
class MergeOfNewProjects : public testing::Test {
protected:
    std::string make(std::u16string const& name, std::u16string const& file) const {
        return project.after({}, [&](ProjectManager& it, TemporaryFolder const& folder) {
            it.create(name);
            it.getFileManager().add({folder.path(file)});
        });
    }

    SampleProject project;
};

TEST_F(MergeOfNewProjects, hasTheFilesOfBoth) {
    auto const merge = mergeTexts({}, make(u"Pumps", u"src/one.cpp"), make(u"Pumps", u"src/two.cpp"));
    ASSERT_EQ(told(merge.conflicts()), "");
    auto const both = project.after({}, [](ProjectManager& it, TemporaryFolder const& folder) {
        it.create(u"Pumps");
        it.getFileManager().add({folder.path(u"src/one.cpp"), folder.path(u"src/two.cpp")});
    });
    EXPECT_EQ(merge.text(), both);
}

TEST_F(MergeOfNewProjects, leavesTwoNamesToAPerson) {
    auto const merge = mergeTexts({}, make(u"Pumps", u"new.txt"), make(u"Station", u"new.txt"));
    ASSERT_EQ(told(merge.conflicts()), R"(Key Name at "Info","ProjectData")");
    EXPECT_EQ(merge.text({MergeSide::Theirs}), make(u"Station", u"new.txt"));
}

TEST_F(MergeOfNewProjects, takesAllChangesOfBothIntoOne) {
    auto const common = project.after({}, makeCommonProject);
    for (auto const& change : projectChanges()) {
        SCOPED_TRACE(change.name);
        bool const adds = change.name.starts_with("add ") || change.name.starts_with("create ") ||
                          change.name.starts_with("label other") || change.name.starts_with("set ");
        if (adds) {
            auto const changed = project.after(common, change.make);
            EXPECT_EQ(contentOf(mergeTexts({}, common, changed).text()), contentOf(changed));
        }
    }
}

TEST(MergeOfLabels, leavesTwoLabelsOfASingleValuedCategoryOnTheFile) {
    SampleProject const project;
    auto const common = project.after({}, makeCommonProject);
    auto const labelled = [&](std::u16string const& uuid) {
        return project.after(common, [&](ProjectManager& it, TemporaryFolder const& folder) {
            auto const category = it.getLabelManager().getCategoryByUUID(u"c-phase");
            auto const label = it.getLabelManager().getLabelByUUID(category, uuid);
            it.getFileManager().addLabels({folder.path(u"main.cpp")}, {management::Label(category, label)});
        });
    };
    auto const merge = mergeTexts(common, labelled(u"l-draft"), labelled(u"l-final"));
    ASSERT_EQ(told(merge.conflicts()), "");
    project.after(merge.text(), [](ProjectManager& it, TemporaryFolder const& folder) {
        EXPECT_EQ(it.getFileManager().getLabelIDSets(folder.path(u"main.cpp")).size(), 2U);
    });
}

} // namespace

} // namespace project::test

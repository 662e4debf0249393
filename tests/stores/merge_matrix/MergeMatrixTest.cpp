// Every pair of changes, made on two branches through the managers and merged, against both made in one
// project.
#include <algorithm>
#include <cctype>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/labels/Label.hpp"
#include "project/stores/TextMerge.hpp"
#include "stores/merge/MergeSamples.hpp"
#include "stores/merge_matrix/ExpectedMerges.hpp"

namespace project::test {

using namespace stores::samples;
using stores::MergeSide;
using stores::mergeTexts;

namespace {

/// One change, merged with all others.
class MergeMatrix : public testing::TestWithParam<NamedChange> {
protected:
    void expectMerged(std::string const& ours, std::string const& theirs, NamedChange const& other) const {
        auto const merge = mergeTexts(common, ours, theirs);
        auto const expected = ExpectedMerges::conflict(GetParam().name, other.name);
        ASSERT_EQ(described(merge.conflicts()), expected);
        if (expected.empty()) {
            merges.expectBoth(merge.text(), GetParam(), other);
        }
    }

    ExpectedMerges const merges;
    SampleProject const& project = merges.project();
    std::string const& common = merges.common();
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
        EXPECT_EQ(described(merge.conflicts()), described(withTail.conflicts()));
        EXPECT_TRUE(readWhole(withTail.text({merge.conflicts().size(), MergeSide::Ours})).isTidy());
    }
}

TEST(MergeMatrixTables, nameOnlyExistingChanges) {
    std::set<std::string> names;
    for (auto const& change : projectChanges()) {
        EXPECT_TRUE(names.insert(change.name).second) << change.name;
    }
    for (auto const& [first, second] : ExpectedMerges::exceptions()) {
        EXPECT_TRUE(names.contains(first) && names.contains(second)) << first << ", " << second;
    }
}

std::string testName(testing::TestParamInfo<NamedChange> const& info) {
    std::string name = info.param.name;
    std::replace_if(
        name.begin(), name.end(), [](unsigned char unit) { return std::isalnum(unit) == 0; }, '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(Changes, MergeMatrix, testing::ValuesIn(projectChanges()), testName);

/// Projects that both sides have just created, without a common version.
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
    ASSERT_EQ(described(merge.conflicts()), "");
    auto const both = project.after({}, [](ProjectManager& it, TemporaryFolder const& folder) {
        it.create(u"Pumps");
        it.getFileManager().add({folder.path(u"src/one.cpp"), folder.path(u"src/two.cpp")});
    });
    EXPECT_EQ(merge.text(), both);
}

TEST_F(MergeOfNewProjects, reportsTwoNamesAsAConflict) {
    auto const merge = mergeTexts({}, make(u"Pumps", u"new.txt"), make(u"Station", u"new.txt"));
    ASSERT_EQ(described(merge.conflicts()), R"(Key Name at "Info","ProjectData")");
    EXPECT_EQ(merge.text({MergeSide::Theirs}), make(u"Station", u"new.txt"));
}

TEST_F(MergeOfNewProjects, containsAllChangesOfBoth) {
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
    ASSERT_EQ(described(merge.conflicts()), "");
    project.after(merge.text(), [](ProjectManager& it, TemporaryFolder const& folder) {
        EXPECT_EQ(it.getFileManager().getLabelIDSets(folder.path(u"main.cpp")).size(), 2U);
    });
}

} // namespace

} // namespace project::test

#include <fstream>
#include <functional>
#include <iterator>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "project/stores/TextMerge.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// The rules of a project that two people change at the same time.
class SyncRuleMerge : public ::testing::Test {
protected:
    using Change = std::function<void(Session&)>;

    SyncRuleMerge() {
        folder_.folder(u"src");
        folder_.folder(u"doc");
        Session::create(folder_.root(), u"Engine", {SourceControl::Off});
    }

    Change sets(SyncRule const& rule) const {
        return [rule](Session& session) { session.setSyncRule(rule); };
    }

    Change removes() const {
        return [this](Session& session) { session.removeSyncRule(folder_.path(u"src")); };
    }

    SyncRule rule(std::set<std::u16string> included, std::set<std::u16string> excluded = {},
                  bool usesGitIgnore = true) const {
        return {folder_.path(u"src"), std::move(included), std::move(excluded), usesGitIgnore};
    }

    std::string after(Change const& change) const {
        auto session = Session::open(folder_.root(), {SourceControl::Off});
        change(session);
        return read();
    }

    std::string read() const {
        std::ifstream file(text(), std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    void write(std::string const& content) const {
        std::ofstream(text(), std::ios::binary | std::ios::trunc) << content;
    }

    std::filesystem::path text() const { return folder_.onDisk() / ".projectdata" / "project.jsonl"; }

    /// The number of conflicts, which is the same if the sides are exchanged, and so is the merged text.
    std::size_t conflicts(Change const& base, Change const& ours, Change const& theirs) {
        auto const common = after(base);
        auto const left = after(ours);
        write(common);
        auto const right = after(theirs);
        auto const merge = stores::mergeTexts(common, left, right);
        auto const reverse = stores::mergeTexts(common, right, left);
        EXPECT_EQ(merge.conflicts().size(), reverse.conflicts().size());
        if (merge.conflicts().empty()) {
            EXPECT_EQ(merge.text(), reverse.text());
            write(merge.text());
        }
        return merge.conflicts().size();
    }

    std::vector<SyncRule> merged() const {
        return Session::open(folder_.root(), {SourceControl::Off}).syncRules();
    }

    static void nothing(Session& /*session*/) {}

    test::TemporaryFolder folder_;
};

TEST_F(SyncRuleMerge, patternsThatBothAddAreInTheResult) {
    EXPECT_EQ(conflicts(sets(rule({u"*.c"})), sets(rule({u"*.c", u"*.h"})),
                        sets(rule({u"*.c", u"*.cpp"}, {u"gen"}))),
              0U);

    EXPECT_THAT(merged(), ElementsAre(rule({u"*.c", u"*.cpp", u"*.h"}, {u"gen"})));
}

TEST_F(SyncRuleMerge, aPatternThatOneRemovesIsNotInTheResult) {
    EXPECT_EQ(
        conflicts(sets(rule({u"*.c", u"*.h"})), sets(rule({u"*.c"})), sets(rule({u"*.c", u"*.h", u"*.txt"}))),
        0U);

    EXPECT_THAT(merged(), ElementsAre(rule({u"*.c", u"*.txt"})));
}

TEST_F(SyncRuleMerge, rulesThatBothCreateForOneFolderBecomeOne) {
    EXPECT_EQ(conflicts(nothing, sets(rule({u"*.c"})), sets(rule({u"*.h"}))), 0U);

    EXPECT_THAT(merged(), ElementsAre(rule({u"*.c", u"*.h"})));
}

TEST_F(SyncRuleMerge, rulesOfDifferentFoldersAreBothInTheResult) {
    SyncRule const ofDoc{folder_.path(u"doc"), {u"*.md"}};

    EXPECT_EQ(conflicts(nothing, sets(rule({u"*.c"})), sets(ofDoc)), 0U);

    EXPECT_THAT(merged(), ElementsAre(ofDoc, rule({u"*.c"})));
}

TEST_F(SyncRuleMerge, whetherGitDecidesIsMergedWithThePatterns) {
    EXPECT_EQ(conflicts(sets(rule({u"*.c"})), sets(rule({u"*.c"}, {}, false)), sets(rule({u"*.h"}))), 0U);

    EXPECT_THAT(merged(), ElementsAre(rule({u"*.h"}, {}, false)));
}

TEST_F(SyncRuleMerge, aRuleThatOneRemovesAndTheOtherChangesIsAConflict) {
    EXPECT_EQ(conflicts(sets(rule({u"*.c"})), removes(), sets(rule({u"*.h"}))), 1U);
}

TEST_F(SyncRuleMerge, aRuleThatOneRemovesIsRemoved) {
    EXPECT_EQ(conflicts(sets(rule({u"*.c"})), removes(), nothing), 0U);

    EXPECT_THAT(merged(), IsEmpty());
}

} // namespace
} // namespace project::session

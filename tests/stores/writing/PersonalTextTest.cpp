#include "project/stores/PersonalText.hpp"

#include <utility>

#include <gmock/gmock.h>

#include "support/TextStore.hpp"

using testing::ElementsAre;
using testing::IsEmpty;

namespace project::test {

namespace {

class PersonalTextStore : public TextStore {
protected:
    static Options personal() {
        auto options = rewriting();
        options.isPersonal = true;
        return options;
    }

    /// Lets the folder's ignore file have this content, and extends it. @return its content then.
    std::string extended(std::string const& ignored) const {
        volume->replaceFile(".gitignore", ignored);
        ignore();
        return volume->content(".gitignore");
    }

    void ignore() const {
        CrashingDisk disk(volume);
        stores::ignorePersonalText(disk);
    }
};

TEST_F(PersonalTextStore, hasAFolderThatSourceControlIgnoresAsAWhole) {
    auto const backend = open(personal());

    commit(*backend, addFiles({u"a"}));

    EXPECT_THAT(volume->names(), ElementsAre(".gitignore", "project.jsonl"));
    EXPECT_EQ("*\n", volume->content(".gitignore"));
    EXPECT_EQ(textOf(addFiles({u"a"})), text());
}

TEST_F(PersonalTextStore, isEmptyAtOnceWhenItsTextIsDeleted) {
    prepare({u"a"});
    auto const backend = open(personal());
    contentOf(*backend);

    volume->remove("project.jsonl");
    Entered const entered(*backend);

    ASSERT_EQ(1U, entered.changes().differences.size());
    EXPECT_EQ(fileAddress(u"a"), entered.changes().differences[0].address);
    EXPECT_EQ(nullptr, entered.changes().differences[0].after);
    EXPECT_THAT(loadAll(*backend), IsEmpty());
}

TEST_F(PersonalTextStore, reportsItsCreationByAnotherProgramAsSingleChanges) {
    auto const backend = open(personal());
    EXPECT_THAT(contentOf(*backend), IsEmpty());
    prepare({u"a"});

    Entered const entered(*backend);

    EXPECT_FALSE(entered.changes().everything);
    ASSERT_EQ(1U, entered.changes().differences.size());
    EXPECT_EQ(fileAddress(u"a"), entered.changes().differences[0].address);
}

TEST_F(PersonalTextStore, isCreatedAgainAfterItsFolderWasDeleted) {
    auto const backend = open(personal());
    commit(*backend, addFiles({u"a"}));
    volume->removeFolder();

    commit(*backend, addFiles({u"b"}));

    EXPECT_EQ(textOf(addFiles({u"b"})), text());
    EXPECT_EQ("*\n", volume->content(".gitignore"));
}

TEST_F(PersonalTextStore, isIgnoredInTheFolderAbove) {
    volume->makeFolder();

    EXPECT_EQ("/project.jsonl.*.tmp\n/local/\n", extended("/project.jsonl.*.tmp\n"));
    EXPECT_EQ("*.bak\n/local/\n", extended("*.bak")); // the last line had no end
    EXPECT_EQ("/local/\n", extended(""));
    EXPECT_EQ("/localised/\n/local/\n", extended("/localised/\n"));
}

TEST_F(PersonalTextStore, leavesAnIgnoreFileAloneThatNamesItsFolder) {
    volume->makeFolder();

    for (std::string const ignored : {"/local/\n", "/local/", "a\nlocal/\nb\n", "/local\r\n", "local"}) {
        EXPECT_EQ(ignored, extended(ignored));
    }
}

TEST_F(PersonalTextStore, createsAMissingIgnoreFile) {
    volume->makeFolder();

    ignore();

    EXPECT_EQ("/local/\n", volume->content(".gitignore"));
}

TEST_F(PersonalTextStore, extendsWhatAnotherProgramHasWrittenMeanwhile) {
    volume->makeFolder();
    volume->replaceFile(".gitignore", "old\n");
    bool isFirst = true;
    volume->beforeCall = [&](std::string const& call) {
        if (call.starts_with("append") && std::exchange(isFirst, false)) {
            volume->replaceFile(".gitignore", "new\n");
        }
    };

    ignore();

    EXPECT_FALSE(isFirst);
    EXPECT_EQ("new\n/local/\n", volume->content(".gitignore"));
}

} // namespace

} // namespace project::test

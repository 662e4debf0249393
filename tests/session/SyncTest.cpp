#include <filesystem>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/session.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/EventLog.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::EntryPointDefinition;
using management::Label;
using management::LabelDefinition;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using Names = std::vector<std::u16string>;

/// A project outside git.
class SyncTest : public ::testing::Test {
protected:
    void rule(std::u16string const& folder, std::set<std::u16string> included = {},
              std::set<std::u16string> excluded = {}) {
        session_.setSyncRule({pathOf(folder), std::move(included), std::move(excluded)});
    }

    Path pathOf(std::u16string const& relative) const {
        return relative.empty() ? folder_.root() : folder_.path(relative);
    }

    void add(std::u16string const& path) { session_.project().getFileManager().add({folder_.file(path)}); }

    /// The files and folders of the project.
    Names listed() {
        Names result;
        for (auto const& file : session_.find({})) {
            result.push_back(relative(file.path));
        }
        return result;
    }

    Names added(SyncPlan const& plan) const {
        Names result;
        for (auto const& file : plan.added) {
            result.push_back(relative(file.path));
        }
        return result;
    }

    Names removed(SyncPlan const& plan) const {
        Names result;
        for (auto const& each : plan.removed) {
            result.push_back(relative(each.file.path));
        }
        return result;
    }

    std::u16string relative(Path const& path) const {
        return metadata::getRelativePath(folder_.root(), path);
    }

    Label createLabel() {
        CategoryDefinition const status(u"Status");
        LabelDefinition const open(u"Open");
        auto& labels = session_.project().getLabelManager();
        labels.createCategory(status);
        labels.createLabel(status, open);
        return {status, open};
    }

    test::TemporaryFolder folder_;
    Session session_ = Session::create(folder_.root(), u"Engine", {SourceControl::Off});
};

TEST_F(SyncTest, withoutARuleNothingIsSynchronised) {
    add(u"src/old.c");
    folder_.file(u"src/new.c");
    folder_.remove(u"src/old.c");

    auto const plan = session_.sync();

    EXPECT_TRUE(plan.isEmpty());
    EXPECT_EQ(listed(), (Names{u"src", u"src/old.c"}));
}

TEST_F(SyncTest, newFilesAreAddedAndThoseThatAreGoneAreRemoved) {
    add(u"src/old.c");
    add(u"src/same.c");
    folder_.file(u"src/deep/new.c");
    folder_.remove(u"src/old.c");
    rule(u"src");

    auto const plan = session_.sync();

    EXPECT_EQ(added(plan), Names{u"src/deep/new.c"});
    EXPECT_EQ(removed(plan), Names{u"src/old.c"});
    EXPECT_EQ(listed(), (Names{u"src", u"src/deep", u"src/deep/new.c", u"src/same.c"}));
    EXPECT_TRUE(session_.sync().isEmpty());
}

TEST_F(SyncTest, filesThatNoRuleIsAboveStayAsTheyAre) {
    add(u"doc/old.md");
    folder_.file(u"doc/new.md");
    folder_.file(u"src/new.c");
    folder_.file(u"src2/new.c");
    folder_.remove(u"doc/old.md");
    rule(u"src");

    session_.sync();

    EXPECT_EQ(listed(), (Names{u"doc", u"doc/old.md", u"src", u"src/new.c"}));
}

TEST_F(SyncTest, theRootMayHaveARule) {
    folder_.file(u"a.c");
    folder_.file(u"src/b.c");
    folder_.file(u"..odd"); // cannot be in a project
    rule(u"");

    session_.sync();

    EXPECT_EQ(listed(), (Names{u"a.c", u"src", u"src/b.c"}));
}

TEST_F(SyncTest, patternsAreRelativeToTheFolderAndHaveTheSyntaxOfAQuery) {
    for (auto const* name :
         {u"src/a.c", u"src/a.h", u"src/io/b.c", u"src/io/b.txt", u"src/gen/c.c", u"x.c"}) {
        folder_.file(name);
    }
    rule(u"src", {u"**/*.c", u"*.h"}, {u"gen/**"});

    EXPECT_EQ(added(session_.planSync()), (Names{u"src/a.c", u"src/a.h", u"src/io/b.c"}));

    rule(u"src", {u"*.c"});

    EXPECT_EQ(added(session_.planSync()), Names{u"src/a.c"});
}

TEST_F(SyncTest, anExcludedFolderIsExcludedWithItsContents) {
    folder_.file(u"src/gen/deep/a.c");
    folder_.file(u"src/b.c");
    rule(u"src", {}, {u"g*n"});

    EXPECT_EQ(added(session_.planSync()), Names{u"src/b.c"});
}

TEST_F(SyncTest, theNearestRuleAboveAFileDecides) {
    for (auto const* name : {u"src/a.c", u"src/a.md", u"src/doc/b.c", u"src/doc/b.md", u"src/out/d/c.md"}) {
        folder_.file(name);
    }
    rule(u"src", {u"**/*.c"}, {u"out"});
    rule(u"src/doc", {u"*.md"});
    rule(u"src/out/d");

    EXPECT_EQ(added(session_.planSync()), (Names{u"src/a.c", u"src/doc/b.md", u"src/out/d/c.md"}));

    rule(u"src/doc", {}, {u"**"}); // nothing is added

    EXPECT_EQ(added(session_.planSync()), (Names{u"src/a.c", u"src/out/d/c.md"}));
}

TEST_F(SyncTest, patternsDecideOnlyAboutNewFiles) {
    add(u"src/kept.txt");
    add(u"src/gone.txt");
    folder_.remove(u"src/gone.txt");
    rule(u"src", {u"*.c"}, {u"*.txt"});

    session_.sync();

    EXPECT_EQ(listed(), (Names{u"src", u"src/kept.txt"}));
}

TEST_F(SyncTest, aFolderThatIsGoneIsRemovedWithAllItsContents) {
    add(u"src/a.c");
    add(u"src/io/b.c");
    add(u"src/io/deep/c.c");
    folder_.remove(u"src/io");
    rule(u"src");

    auto const plan = session_.sync();

    EXPECT_EQ(removed(plan), (Names{u"src/io", u"src/io/b.c", u"src/io/deep", u"src/io/deep/c.c"}));
    EXPECT_EQ(listed(), (Names{u"src", u"src/a.c"}));
}

TEST_F(SyncTest, emptyFoldersAreNotAdded) {
    folder_.folder(u"src/empty");
    rule(u"src");

    EXPECT_TRUE(session_.sync().isEmpty());
}

TEST_F(SyncTest, theFoldersAboveAnAddedFileKeepTheirLabels) {
    add(u"src/a.c");
    auto const label = createLabel();
    session_.project().getFileManager().addLabels({folder_.path(u"src"), folder_.path(u"src/a.c")}, {label});
    folder_.file(u"src/b.c");
    rule(u"src");

    session_.sync();

    auto const found = session_.find({.labels = {{label.getCategory().getUUID(), label.getUUID()}}});
    EXPECT_THAT(found, ElementsAre(FoundFile{folder_.path(u"src"), FileKind::Folder},
                                   FoundFile{folder_.path(u"src/a.c"), FileKind::File}));
}

TEST_F(SyncTest, thePlanSaysWhatIsLost) {
    add(u"src/a.c");
    add(u"src/b.c");
    auto const label = createLabel();
    session_.project().getFileManager().addLabels({folder_.path(u"src/a.c")}, {label});
    EntryPointDefinition entry(folder_.path(u"src/a.c"));
    entry.setName(u"Main");
    session_.project().getEntryPointManager().setEntryPoint(entry);
    folder_.remove(u"src/a.c");
    folder_.file(u"src/c.c");
    rule(u"src");

    auto const plan = session_.planSync();

    ASSERT_EQ(removed(plan), Names{u"src/a.c"});
    EXPECT_TRUE(plan.removed[0].isAnythingLost());
    EXPECT_THAT(
        plan.removed[0].labels,
        ElementsAre(testing::AllOf(testing::Field(&LabelChoice::categoryUUID, label.getCategory().getUUID()),
                                   testing::Field(&LabelChoice::labelUUID, label.getUUID()))));
    EXPECT_THAT(plan.removed[0].entryPoints, ElementsAre(u"Main"));
    EXPECT_EQ(listed(), (Names{u"src", u"src/a.c", u"src/b.c"})) << "a plan changes nothing";

    session_.sync();

    EXPECT_THAT(session_.project().getEntryPointManager().getEntryPoints(), IsEmpty());
}

TEST_F(SyncTest, aMissingOrEmptyFolderIsRefused) {
    for (bool const isEmpty : {false, true}) {
        add(u"src/a.c");
        rule(u"src");
        folder_.remove(u"src");
        if (isEmpty) {
            folder_.folder(u"src");
        }

        EXPECT_THAT(session_.planSync().missing, ElementsAre(folder_.path(u"src")));
        EXPECT_RAISES(SyncFolderMissing, (folder_.path(u"src")), session_.sync());
        EXPECT_EQ(listed(), (Names{u"src", u"src/a.c"}));

        auto const plan = session_.sync({.removesMissingFolders = true});

        EXPECT_EQ(removed(plan), Names{u"src/a.c"});
        EXPECT_EQ(listed(), Names{u"src"}) << "the folder keeps its rule";
        EXPECT_TRUE(session_.sync().isEmpty());
        EXPECT_EQ(session_.syncRules().size(), 1U);
    }
}

TEST_F(SyncTest, aMissingFolderWithItsOwnRuleIsRefusedBelowAnotherRuleToo) {
    add(u"src/mount/a.c");
    add(u"src/b.c");
    rule(u"");
    rule(u"src/mount");
    folder_.remove(u"src/mount");

    EXPECT_RAISES(SyncFolderMissing, (folder_.path(u"src/mount")), session_.sync());

    session_.sync({.removesMissingFolders = true});

    EXPECT_EQ(listed(), (Names{u"src", u"src/b.c", u"src/mount"}));
    EXPECT_EQ(session_.syncRules().size(), 2U);
}

TEST_F(SyncTest, aRuleOfAMissingFolderWithoutFilesDoesNothing) {
    folder_.folder(u"src");
    rule(u"src");
    folder_.remove(u"src");

    EXPECT_TRUE(session_.sync().isEmpty());
}

TEST_F(SyncTest, symbolicLinksAreFilesAndAreNotFollowed) {
    test::TemporaryFolder const elsewhere;
    elsewhere.file(u"secret");
    folder_.file(u"src/a.c");
    folder_.addLink("src/link", elsewhere.onDisk());
    rule(u"src");

    EXPECT_EQ(added(session_.sync()), (Names{u"src/a.c", u"src/link"}));
}

TEST_F(SyncTest, aFolderThatBecameASymbolicLinkCountsAsMissing) {
    test::TemporaryFolder const elsewhere;
    elsewhere.file(u"a.c");
    elsewhere.file(u"secret");
    add(u"src/a.c");
    rule(u"src");
    folder_.remove(u"src");
    folder_.addLink("src", elsewhere.onDisk());

    EXPECT_RAISES(SyncFolderMissing, (folder_.path(u"src")), session_.sync());
}

TEST_F(SyncTest, aFileThatBecameAFolderAndTheReverse) {
    add(u"src/one");
    add(u"src/two/b.c");
    folder_.remove(u"src/one");
    folder_.file(u"src/one/a.c");
    folder_.remove(u"src/two");
    folder_.file(u"src/two");
    rule(u"src");

    session_.sync();

    EXPECT_EQ(listed(), (Names{u"src", u"src/one", u"src/one/a.c", u"src/two"}));
    EXPECT_TRUE(session_.sync().isEmpty());
}

TEST_F(SyncTest, rulesAreReadAsTheyWereSet) {
    folder_.folder(u"src/gen");
    SyncRule const ofRoot{folder_.root(), {u"*.c", u"**/*.h"}, {u"x"}};
    SyncRule const ofGen{folder_.path(u"src/gen"), {}, {}, false};
    session_.setSyncRule(ofGen);
    session_.setSyncRule(ofRoot);

    EXPECT_THAT(session_.syncRules(), ElementsAre(ofRoot, ofGen));
    EXPECT_THAT(Session::open(folder_.root(), {SourceControl::Off}).syncRules(), ElementsAre(ofRoot, ofGen));
}

TEST_F(SyncTest, settingARuleReplacesIt) {
    folder_.folder(u"src");
    rule(u"src", {u"*.c"}, {u"*.h"});
    SyncRule const other{folder_.path(u"src"), {u"*.txt"}};

    session_.setSyncRule(other);

    EXPECT_THAT(session_.syncRules(), ElementsAre(other));
}

TEST_F(SyncTest, removingARuleLeavesThoseBelowIt) {
    folder_.folder(u"src/gen");
    rule(u"", {u"*.c"});
    rule(u"src");
    SyncRule const ofGen{folder_.path(u"src/gen"), {}, {u"*.o"}};
    session_.setSyncRule(ofGen);

    EXPECT_TRUE(session_.removeSyncRule(folder_.path(u"src")));
    EXPECT_FALSE(session_.removeSyncRule(folder_.path(u"src")));
    EXPECT_TRUE(session_.removeSyncRule(folder_.root()));

    EXPECT_THAT(session_.syncRules(), ElementsAre(ofGen));
}

TEST_F(SyncTest, aRuleIsRemovedFromTheProjectWithItsFolder) {
    add(u"src/a.c");
    rule(u"src");

    session_.project().getFileManager().remove({folder_.path(u"src")});

    EXPECT_THAT(session_.syncRules(), IsEmpty());
}

TEST_F(SyncTest, onlyAFolderInsideTheProjectCanHaveARule) {
    test::TemporaryFolder const elsewhere;
    folder_.file(u"file");
    folder_.folder(u".git/hooks");
    folder_.addLink("link", elsewhere.onDisk());
    elsewhere.folder(u"below");

    for (auto const* name :
         {u"none", u"file", u".projectdata", u".git/hooks", u"link", u"link/below", u".."}) {
        EXPECT_RAISES(SyncFolderUnsuitable, (folder_.path(name)), session_.setSyncRule({folder_.path(name)}));
    }
    EXPECT_RAISES(SyncFolderUnsuitable, (elsewhere.root()), session_.setSyncRule({elsewhere.root()}));
    EXPECT_THAT(session_.syncRules(), IsEmpty());
}

TEST_F(SyncTest, rulesOfImpossibleFoldersInATextAreIgnored) {
    using metadata::MetadataPath;
    using metadata::PathElement;
    std::map<MetadataPath, std::shared_ptr<metadata::MetadataNode>> nodes;
    auto const scope = MetadataPath::root().child(PathElement(u"Files", u"SyncRules"));
    for (auto const* name : {u"..", u".", u"", u"a/b", u".git", u".projectdata", u"..x"}) {
        nodes[scope.child(PathElement(u"File", name))] =
            std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
    }
    session_.store().setNodes(nodes);

    EXPECT_THAT(session_.syncRules(), IsEmpty());
    EXPECT_TRUE(session_.sync().isEmpty());
}

TEST_F(SyncTest, isRolledBackWithItsTransaction) {
    folder_.file(u"src/a.c");
    rule(u"src");
    {
        auto const transaction = session_.transaction();
        session_.sync();
        EXPECT_EQ(listed(), (Names{u"src", u"src/a.c"}));
    }
    EXPECT_THAT(listed(), IsEmpty());
}

TEST_F(SyncTest, observersGetTheEventsOfTheFilesAndOfTheRule) {
    test::EventLog log(*session_.events());
    add(u"src/old.c");
    folder_.file(u"src/new.c");
    folder_.remove(u"src/old.c");
    log.take();

    rule(u"src");
    session_.sync();
    session_.sync();

    auto const path = [this](char16_t const* name) { return folder_.path(name).native(); };
    EXPECT_THAT(log.take(), ElementsAre(u"metadataChange", u"fileListUpdate " + path(u"src/old.c"),
                                        u"fileListUpdate " + path(u"src/new.c")));
}

/// The same in a git repository.
class SyncInRepository : public SyncTest {
protected:
    SyncInRepository() { session_ = Session::open(folder_.root()); }

    std::string status() const { return git_.run({"status", "--porcelain", "--no-renames"}); }

    test::GitFolder const git_{folder_.onDisk()};
};

TEST_F(SyncInRepository, filesThatGitIgnoresAreNotAdded) {
    folder_.file(u".gitignore", "*.o\n/src/out/\n!keep.o\n");
    folder_.file(u"src/.gitignore", "local\n");
    for (auto const* name :
         {u"src/a.c", u"src/a.o", u"src/keep.o", u"src/local", u"src/out/b.c", u"src/io/c.o"}) {
        folder_.file(name);
    }
    rule(u"src");

    EXPECT_EQ(added(session_.planSync()), (Names{u"src/.gitignore", u"src/a.c", u"src/keep.o"}));

    session_.setSyncRule({folder_.path(u"src"), {}, {u".gitignore"}, false});

    EXPECT_EQ(added(session_.planSync()),
              (Names{u"src/a.c", u"src/a.o", u"src/io/c.o", u"src/keep.o", u"src/local", u"src/out/b.c"}));
}

TEST_F(SyncInRepository, theRulesOfGitApplyToASessionWithoutSourceControlToo) {
    folder_.file(u".gitignore", "*.o\n");
    folder_.file(u"src/a.o");
    rule(u"src");

    EXPECT_TRUE(Session::open(folder_.root(), {SourceControl::Off}).planSync().isEmpty());
}

TEST_F(SyncInRepository, aTrackedFileIsNotIgnored) {
    folder_.file(u".gitignore", "out/\n");
    folder_.file(u"src/out/tracked.c");
    folder_.file(u"src/out/other.c");
    git_.run({"add", "-f", "src/out/tracked.c"});
    rule(u"src");

    EXPECT_EQ(added(session_.planSync()), Names{u"src/out/tracked.c"});
}

TEST_F(SyncInRepository, anIgnoredFileThatIsInTheProjectStaysUntilItIsGone) {
    folder_.file(u".gitignore", "*.o\n");
    add(u"src/a.o");
    add(u"src/b.c");
    rule(u"src");

    EXPECT_TRUE(session_.sync().isEmpty());

    folder_.remove(u"src/a.o");
    session_.sync();

    EXPECT_EQ(listed(), (Names{u"src", u"src/b.c"}));
}

TEST_F(SyncInRepository, aRuleInAnIgnoredFolderAppliesWithoutTheRulesOfGit) {
    folder_.file(u".gitignore", "out/\n");
    folder_.file(u"out/a.c");
    folder_.file(u"out/report/b.txt");
    rule(u"");
    session_.setSyncRule({folder_.path(u"out/report"), {}, {}, false});

    EXPECT_EQ(added(session_.planSync()), (Names{u".gitignore", u"out/report/b.txt"}));
}

TEST_F(SyncInRepository, anotherRepositoryInsideIsLeftOut) {
    folder_.file(u"src/a.c");
    folder_.file(u"src/other/b.c");
    test::GitFolder const other(folder_.onDisk() / "src/other");
    rule(u"src");

    EXPECT_EQ(added(session_.planSync()), Names{u"src/a.c"});

    session_.setSyncRule({folder_.path(u"src/other"), {}, {}, false});

    EXPECT_EQ(added(session_.planSync()), (Names{u"src/a.c", u"src/other/b.c"}));
}

TEST_F(SyncInRepository, theChangeIsStaged) {
    add(u"src/old.c");
    git_.commitAll();
    folder_.file(u"src/new.c");
    folder_.remove(u"src/old.c");
    rule(u"src");

    session_.sync();

    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nA  src/new.c\nD  src/old.c\n");
}

TEST_F(SyncInRepository, filesThatASparseCheckoutLeftOutAreNotGone) {
    add(u"src/a.c");
    add(u"src/io/b.c");
    add(u"src/io/c.c");
    rule(u"src");
    git_.commitAll();
    git_.run({"sparse-checkout", "set", "--no-cone", "/*", "!/src/io/"});
    ASSERT_FALSE(std::filesystem::exists(folder_.onDisk() / "src/io"));

    EXPECT_TRUE(session_.sync().isEmpty());
    EXPECT_EQ(listed(), (Names{u"src", u"src/a.c", u"src/io", u"src/io/b.c", u"src/io/c.c"}));
}

TEST_F(SyncInRepository, aFolderStaysInWhichGitTracksAnotherFile) {
    add(u"src/a.c");
    add(u"src/io/b.c");
    folder_.file(u"src/io/unlisted.c");
    rule(u"src", {}, {u"io/unlisted.c"});
    git_.commitAll();
    folder_.remove(u"src/io");

    session_.sync();

    EXPECT_EQ(listed(), (Names{u"src", u"src/a.c", u"src/io"}));
    EXPECT_EQ(git_.run({"ls-files", "src"}), "src/a.c\nsrc/io/unlisted.c\n");
}

TEST_F(SyncInRepository, aFileThatAnotherProgramRenamedKeepsItsLabelsAndItsEntryPoint) {
    session_.project().getFileManager().add({folder_.file(u"src/old.c", "the pump\n")});
    auto const label = createLabel();
    session_.project().getFileManager().addLabels({folder_.path(u"src/old.c")}, {label});
    EntryPointDefinition entry(folder_.path(u"src/old.c"));
    session_.project().getEntryPointManager().setEntryPoint(entry);
    rule(u"src");
    git_.commitAll();
    folder_.folder(u"src/io");
    std::filesystem::rename(folder_.onDisk() / "src/old.c", folder_.onDisk() / "src/io/new.c");

    auto const plan = session_.sync();

    EXPECT_EQ(plan.renamed, (std::vector<Move>{{folder_.path(u"src/old.c"), folder_.path(u"src/io/new.c")}}));
    EXPECT_THAT(plan.added, IsEmpty());
    EXPECT_THAT(plan.removed, IsEmpty());
    EXPECT_EQ(listed(), (Names{u"src", u"src/io", u"src/io/new.c"}));
    EXPECT_FALSE(session_.project().getFileManager().getLabelIDSets(folder_.path(u"src/io/new.c")).empty());
    EXPECT_EQ(session_.project().getEntryPointManager().getEntryPoints().front()->getFile(),
              folder_.path(u"src/io/new.c"));
    EXPECT_EQ(git_.run({"status", "--porcelain"}),
              "M  .projectdata/project.jsonl\nR  src/old.c -> src/io/new.c\n");
}

TEST_F(SyncInRepository, aRenameThatIsStagedIsFollowedToo) {
    session_.project().getFileManager().add({folder_.file(u"src/old.c", "the pump\n")});
    rule(u"src");
    git_.commitAll();
    git_.run({"mv", "src/old.c", "src/new.c"});

    EXPECT_EQ(session_.sync().renamed.size(), 1U);
}

TEST_F(SyncInRepository, ofSeveralEqualFilesOnlyThoseOfTheSameNameAreFollowed) {
    for (auto const* name : {u"src/a/x.c", u"src/a/y.c"}) {
        session_.project().getFileManager().add({folder_.file(name, "the same\n")});
    }
    session_.project().getFileManager().add({folder_.file(u"src/a/empty", "")});
    session_.project().getFileManager().add({folder_.file(u"src/a/changed", "before\n")});
    rule(u"src");
    git_.commitAll();
    folder_.remove(u"src/a");
    folder_.file(u"src/b/x.c", "the same\n");
    folder_.file(u"src/b/z.c", "the same\n");
    folder_.file(u"src/b/w.c", "the same\n");
    folder_.file(u"src/b/other", "");
    folder_.file(u"src/b/changed", "after\n");

    auto const plan = session_.sync();

    EXPECT_EQ(plan.renamed, (std::vector<Move>{{folder_.path(u"src/a/x.c"), folder_.path(u"src/b/x.c")}}));
    EXPECT_EQ(added(plan), (Names{u"src/b/changed", u"src/b/other", u"src/b/w.c", u"src/b/z.c"}));
}

TEST_F(SyncInRepository, renamesAreNotFollowedIfTheOptionsSaySo) {
    session_.project().getFileManager().add({folder_.file(u"src/old.c", "the pump\n")});
    rule(u"src");
    git_.commitAll();
    std::filesystem::rename(folder_.onDisk() / "src/old.c", folder_.onDisk() / "src/new.c");

    auto const plan = session_.sync({.followsRenames = false});

    EXPECT_THAT(plan.renamed, IsEmpty());
    EXPECT_EQ(removed(plan), Names{u"src/old.c"});
}

TEST_F(SyncTest, outsideARepositoryNoRenameIsGuessed) {
    add(u"src/old.c");
    rule(u"src");
    std::filesystem::rename(folder_.onDisk() / "src/old.c", folder_.onDisk() / "src/new.c");

    EXPECT_THAT(session_.sync().renamed, IsEmpty());
    EXPECT_EQ(listed(), (Names{u"src", u"src/new.c"}));
}

TEST_F(SyncTest, aRuleMovesWithItsFolder) {
    add(u"src/io/a.c");
    rule(u"src/io", {u"*.c"});

    session_.move({folder_.path(u"src")}, folder_.path(u"lib"));

    ASSERT_EQ(session_.syncRules().size(), 1U);
    EXPECT_EQ(session_.syncRules().front(), (SyncRule{folder_.path(u"lib/io"), {u"*.c"}}));
}

TEST_F(SyncTest, aRuleFollowsAnAdoptedFolder) {
    add(u"src/a.c");
    rule(u"src", {u"*.c"});
    std::filesystem::rename(folder_.onDisk() / "src", folder_.onDisk() / "lib");

    session_.adopt({{folder_.path(u"src"), folder_.path(u"lib")}});

    ASSERT_EQ(session_.syncRules().size(), 1U);
    EXPECT_EQ(session_.syncRules().front(), (SyncRule{folder_.path(u"lib"), {u"*.c"}}));
    EXPECT_THAT(session_.planSync().absent, IsEmpty());
}

TEST_F(SyncTest, thePlanNamesFoldersOfRulesThatDoNotExist) {
    add(u"src/a.c");
    rule(u"src");
    session_.adopt({{folder_.path(u"src/a.c"), folder_.path(u"lib/a.c")}});
    std::filesystem::rename(folder_.onDisk() / "src", folder_.onDisk() / "lib");

    EXPECT_THAT(session_.planSync().absent, ElementsAre(folder_.path(u"src")));
}

} // namespace
} // namespace project::session

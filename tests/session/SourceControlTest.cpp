#include <filesystem>
#include <fstream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/git/GitError.hpp"
#include "project/session.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

/// A folder in a git repository with a first commit in it.
class SessionInRepository : public ::testing::Test {
protected:
    void SetUp() override { git_.run({"commit", "-q", "--allow-empty", "-m", "first"}); }

    /// What would be committed, and what is left out of it.
    std::string status() const { return git_.run({"status", "--porcelain", "--untracked-files=all"}); }

    std::string staged() const { return git_.run({"show", ":.projectdata/project.jsonl"}); }

    std::string onDisk() const {
        std::ifstream file(folder_.onDisk() / ".projectdata" / "project.jsonl", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    static constexpr char const* storeAdded =
        "A  .projectdata/.gitattributes\nA  .projectdata/.gitignore\nA  .projectdata/project.jsonl\n";

    test::TemporaryFolder folder_;
    test::GitFolder const git_{folder_.onDisk()};
};

TEST_F(SessionInRepository, stagesTheFilesOfANewProjectWithAllThatIsInThem) {
    Session::make(folder_.root(), u"Engine");

    EXPECT_EQ(status(), storeAdded);
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesWhatIsAddedTogetherWithItsEntry) {
    auto session = Session::make(folder_.root(), u"Engine");

    session.project().getFileManager().add({folder_.file(u"src/pump.cpp")});

    EXPECT_EQ(status(), std::string(storeAdded) + "A  src/pump.cpp\n");
    EXPECT_THAT(staged(), HasSubstr("\"src/pump.cpp\"\n"));
}

TEST_F(SessionInRepository, takesWhatIsRemovedOutOfTheIndexTogetherWithItsEntry) {
    auto session = Session::make(folder_.root(), u"Engine");
    session.project().getFileManager().add({folder_.file(u"src/pump.cpp")});
    git_.commitAll();

    session.project().getFileManager().remove({folder_.path(u"src")});

    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nD  src/pump.cpp\n?? src/pump.cpp\n");
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesAFileAgainThatComesBackBeforeItsRemovalIsCommitted) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto const file = folder_.file(u"a");
    session.project().getFileManager().add({file, folder_.file(u"b")});
    git_.commitAll();
    session.project().getFileManager().remove({file});
    ASSERT_EQ(status(), "M  .projectdata/project.jsonl\nD  a\n?? a\n");

    session.project().getFileManager().add({file});

    EXPECT_EQ(status(), "");
}

TEST_F(SessionInRepository, stagesTheTextAfterEveryKindOfChange) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto& project = session.project();
    auto const file = folder_.file(u"a");
    project.getFileManager().add({file});
    management::CategoryDefinition const category(u"Status");
    management::LabelDefinition const done(u"Done");
    management::Label const label(category, done);
    management::EntryPointDefinition entry(file);
    management::EntryPointGroupDefinition const group(u"Nightly", u"g");
    std::vector const reference{management::relativeFolderReference(folder_.root(), folder_.root())};
    git_.commitAll();

    std::vector<std::function<void()>> const changes{
        [&] { project.setName(u"Pump"); },
        [&] { project.setDescription(u"About it"); },
        [&] { project.create(u"Valve"); },
        [&] { project.getLabelManager().createCategory(category); },
        [&] { project.getLabelManager().renameCategory(category, u"State"); },
        [&] { project.getLabelManager().createLabel(category, done); },
        [&] { project.getFileManager().addLabels({file}, {label}); },
        [&] { project.getFileManager().removeLabels({file}, {label}); },
        [&] { project.getFileManager().addLabels({file}, {label}); },
        [&] { project.getFileManager().removeCategory({file}, category); },
        [&] { project.getLabelManager().deleteLabel(category, done); },
        [&] { project.getLabelManager().deleteCategory(category); },
        [&] { project.getEntryPointManager().setEntryPoint(entry); },
        [&] { project.getEntryPointManager().removeEntryPoint(file); },
        [&] { project.getEntryPointManager().createEntryPointGroup(group); },
        [&] { project.getEntryPointManager().renameEntryPointGroup(group, u"Weekly"); },
        [&] { project.getEntryPointManager().deleteEntryPointGroup(group); },
        [&] { project.getProjectPathManager().getFolderReferenceManager().addReferences(reference); },
        [&] { project.getProjectPathManager().getFolderReferenceManager().removeReferences(reference); },
        [&] { project.getProjectReferenceManager().getFolderReferenceManager().addReferences(reference); },
        [&] { project.getProjectReferenceManager().getFolderReferenceManager().removeReferences(reference); },
    };
    for (std::size_t index = 0; index < changes.size(); ++index) {
        auto const before = onDisk();
        changes[index]();
        EXPECT_NE(onDisk(), before) << index;
        EXPECT_EQ(staged(), onDisk()) << index;
    }
    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\n");
}

TEST_F(SessionInRepository, stagesBeforeItTellsObservers) {
    auto session = Session::make(folder_.root(), u"Engine");
    std::string seen;
    session.events()->onNameChanged([&] { seen = staged(); });

    session.project().setName(u"Pump");

    EXPECT_THAT(seen, HasSubstr("Pump"));
}

TEST_F(SessionInRepository, stagesNothingOfATextThatGitDoesNotTrack) {
    auto session = Session::make(folder_.root(), u"Engine");
    git_.run({"rm", "-q", "-r", "--cached", ".projectdata"});

    session.project().setName(u"Pump");

    EXPECT_EQ(status(),
              "?? .projectdata/.gitattributes\n?? .projectdata/.gitignore\n?? .projectdata/project.jsonl\n");
}

TEST_F(SessionInRepository, leavesGitAloneWhenToldSo) {
    Options options;
    options.sourceControl = SourceControl::Off;
    auto session = Session::make(folder_.root(), u"Engine", options);
    session.project().getFileManager().add({folder_.file(u"a")});
    session.stage();

    EXPECT_EQ(status(), "?? .projectdata/.gitattributes\n?? .projectdata/.gitignore\n"
                        "?? .projectdata/project.jsonl\n?? a\n");
    EXPECT_THAT(session.trackedOutsideProject({folder_.root()}), IsEmpty());
}

TEST_F(SessionInRepository, stagesTheTextOnceWhenAsked) {
    Options options;
    options.sourceControl = SourceControl::WhenAsked;
    auto session = Session::make(folder_.root(), u"Engine", options);
    session.project().getFileManager().add({folder_.file(u"a")});
    EXPECT_THAT(status(), AllOf(HasSubstr("A  a\n"), HasSubstr("AM .projectdata/project.jsonl\n")));

    session.stage();

    EXPECT_EQ(status(), std::string(storeAdded) + "A  a\n");
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesATidyText) {
    Options options;
    options.sourceControl = SourceControl::WhenAsked;
    auto session = Session::make(folder_.root(), u"Engine", options);
    session.project().setDescription(std::u16string(300'000, u'x')); // large enough to be appended to
    session.project().setName(u"Pump");
    EXPECT_EQ(onDisk().find("{\"end\":\"project-definition\"}"),
              onDisk().rfind("{\"end\":\"project-definition\"}"));
    EXPECT_THAT(onDisk(), Not(::testing::EndsWith("{\"end\":\"project-definition\"}\n")));

    session.stage();

    EXPECT_EQ(staged(), onDisk());
    EXPECT_THAT(staged(), ::testing::EndsWith("{\"end\":\"project-definition\"}\n"));
}

TEST_F(SessionInRepository, changesNothingWhenTheIndexIsLockedAndCanTryAgain) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto const file = folder_.file(u"a");
    folder_.addFile(".git/index.lock");

    try {
        session.project().getFileManager().add({file});
        FAIL() << "nothing was thrown";
    } catch (git::GitError const& error) {
        EXPECT_THAT(error.what(), HasSubstr("index.lock"));
    }
    EXPECT_FALSE(session.project().getFileManager().isFileInProject(file));

    std::filesystem::remove(folder_.onDisk() / ".git" / "index.lock");
    session.project().getFileManager().add({file});
    EXPECT_EQ(status(), std::string(storeAdded) + "A  a\n");
}

TEST_F(SessionInRepository, keepsAChangeWhoseTextCannotBeStagedAndStagesItWithTheNext) {
    auto session = Session::make(folder_.root(), u"Engine");
    folder_.addFile(".git/index.lock");

    EXPECT_THROW(session.project().setName(u"Pump"), git::GitError);
    EXPECT_EQ(session.project().getName(), u"Pump");

    std::filesystem::remove(folder_.onDisk() / ".git" / "index.lock");
    session.project().setDescription(u"About it");
    EXPECT_THAT(staged(), AllOf(HasSubstr("Pump"), HasSubstr("About it")));
}

TEST_F(SessionInRepository, namesWhatGitTracksBelowAFolderAndTheProjectDoesNotHave) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto const inProject = folder_.file(u"src/a");
    auto const tracked = folder_.file(u"src/b");
    auto const elsewhere = folder_.file(u"other/c");
    session.project().getFileManager().add({inProject});
    git_.commitAll();

    EXPECT_THAT(session.trackedOutsideProject({folder_.path(u"src")}), ElementsAre(tracked));
    EXPECT_THAT(session.trackedOutsideProject({inProject, elsewhere}), IsEmpty());
}

TEST_F(SessionInRepository, worksInAFolderBelowTheTopOfTheRepository) {
    folder_.addFolder("engine");
    auto session = Session::make(folder_.root() / u"engine", u"Engine");

    session.project().getFileManager().add({folder_.file(u"engine/src/pump.cpp")});

    EXPECT_EQ(status(), "A  engine/.projectdata/.gitattributes\nA  engine/.projectdata/.gitignore\n"
                        "A  engine/.projectdata/project.jsonl\nA  engine/src/pump.cpp\n");
}

TEST(SessionOutsideAnyRepository, worksAllTheSame) {
    test::TemporaryFolder const folder;
    auto session = Session::make(folder.root(), u"Engine");

    session.project().getFileManager().add({folder.file(u"a")});
    session.stage();

    EXPECT_TRUE(session.project().getFileManager().isFileInProject(folder.path(u"a")));
    EXPECT_THAT(session.trackedOutsideProject({folder.root()}), IsEmpty());
}

} // namespace
} // namespace project::session

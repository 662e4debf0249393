#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <set>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/git/GitError.hpp"
#include "project/session.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TracedProcess.hpp"

namespace project::session {
namespace {

namespace files = std::filesystem;

using management::CategoryDefinition;
using management::Label;
using management::LabelDefinition;

/// Kills a process at each step of a move, and looks at the project that the next change finds.
class InterruptedMoves : public ::testing::Test {
protected:
    using Change = std::function<void(Session&, Path const& root)>;

    /// Everything that a move changes: the files on disk, and git's index with the definition in it.
    struct State {
        std::map<std::string, std::string> disk;
        std::string index;

        friend bool operator==(State const&, State const&) = default;
    };

    InterruptedMoves() {
        files::create_directory(original());
        test::GitFolder const git(original());
        auto session = Session::create(root(original()), u"Engine");
        for (auto const* name : {"a", "src/b", "src/deep/c", "src/loose"}) {
            files::create_directories((original() / name).parent_path());
            std::ofstream(original() / name) << "content of " << name;
        }
        CategoryDefinition const status(u"Status");
        Label const done(status, LabelDefinition(u"Done"));
        session.project().getLabelManager().createCategory(status);
        session.project().getLabelManager().createLabel(status, done.getLabelIdentifier());
        auto const at = [&](std::u16string const& name) { return root(original()) / Path(name); };
        session.project().getFileManager().add({at(u"a"), at(u"src/b"), at(u"src/deep/c")});
        session.project().getFileManager().addLabels({at(u"a"), at(u"src"), at(u"src/b")}, {done});
        git.run({"commit", "-q", "-a", "-m", "first"});
    }

    files::path original() const { return folder_.onDisk() / "original"; }

    files::path copy() const { return folder_.onDisk() / "copy"; }

    static Path root(files::path const& path) { return fl::filesystem::fromSystem(path); }

    static State stateOf(files::path const& project) {
        State result;
        for (auto entry = files::recursive_directory_iterator(project); entry != files::end(entry); ++entry) {
            auto const name = entry->path().filename();
            if (name == ".git" || name == "local") { // a folder without a record means nothing
                entry.disable_recursion_pending();
            } else if (entry->is_regular_file()) {
                std::ifstream file(entry->path(), std::ios::binary);
                result.disk[entry->path().lexically_relative(project).string()] = {
                    std::istreambuf_iterator<char>(file), {}};
            }
        }
        result.index = test::GitFolder(project).run({"ls-files", "-s"});
        return result;
    }

    static std::string differences(State const& left, State const& right) {
        std::string result;
        for (auto const* state : {&left, &right}) {
            for (auto const& file : state->disk) {
                auto const& other = state == &left ? right.disk : left.disk;
                auto const found = other.find(file.first);
                bool const isSame = found != other.end() && found->second == file.second;
                result += isSame ? "" : "\n" + file.first + ": " + file.second;
            }
        }
        return result + (left.index == right.index ? "" : "\n" + left.index + "\n" + right.index);
    }

    /// Writes the project's name as it is, which recovers a move. Deletes git's lock, as the error demands.
    static std::optional<RecoveredMoves> recover(files::path const& project, SourceControl mode) {
        auto session = Session::open(root(project), {mode});
        for (int attempt = 0;; ++attempt) {
            try {
                session.project().setName(u"Engine");
                session.stage();
                return session.takeRecoveredMoves();
            } catch (git::GitError const& error) {
                if (attempt > 0 || error.kind() != git::GitError::Kind::Busy) {
                    throw;
                }
                files::remove(error.file());
            }
        }
    }

    /// @return the number of steps.
    std::size_t expectOldOrNew(Change const& change, SourceControl mode = SourceControl::EachChange) {
        auto const run = [&](files::path const& project) {
            auto session = Session::open(root(project), {mode});
            change(session, root(project));
            session.stage();
        };
        auto const old = stateOf(original());
        makeCopy();
        run(copy());
        auto const fresh = stateOf(copy());
        EXPECT_FALSE(old == fresh);
        std::set<std::string> outcomes;
        for (std::size_t call = 1;; ++call) {
            makeCopy();
            auto const name = test::killAtCall(call, [&] { run(copy()); });
            auto const before = stateOf(copy());
            auto const recovered = recover(copy(), mode);
            auto const after = stateOf(copy());
            auto const at = std::to_string(call) + " " + name.value_or("none");
            EXPECT_TRUE(after == old || after == fresh) << at << differences(old, after);
            EXPECT_FALSE(files::exists(copy() / ".projectdata" / "local" / "moves")) << at;
            auto const moved = [](State const& state) {
                auto shown = state.disk;
                std::erase_if(shown, [](auto const& file) { return file.first.starts_with('.'); });
                return shown;
            };
            if (moved(before) != moved(after)) {
                EXPECT_TRUE(recovered && recovered->outcome == RecoveredMoves::Outcome::RolledBack) << at;
            }
            if (recovered) {
                bool const isNew = recovered->outcome == RecoveredMoves::Outcome::Completed;
                EXPECT_TRUE(after == (isNew ? fresh : old)) << at;
                outcomes.insert(isNew ? "completed" : "rolled back");
            }
            if (!name) {
                EXPECT_THAT(outcomes, ::testing::ElementsAre("completed", "rolled back"));
                return call - 1;
            }
        }
    }

private:
    void makeCopy() const {
        files::remove_all(copy());
        files::copy(original(), copy(), files::copy_options::recursive);
        test::GitFolder(copy()).run({"update-index", "-q", "--refresh"});
    }

    test::TemporaryFolder folder_;
};

TEST_F(InterruptedMoves, ofAFolderLeaveTheOldStateOrTheNewOne) {
    auto const steps = expectOldOrNew(
        [](Session& session, Path const& root) { session.move({root / Path(u"src")}, root / Path(u"lib")); });
    EXPECT_GT(steps, 20U);
}

TEST_F(InterruptedMoves, ofSeveralFilesLeaveTheOldStateOrTheNewOne) {
    expectOldOrNew([](Session& session, Path const& root) {
        session.move({root / Path(u"a"), root / Path(u"src/b")}, root / Path(u"src/deep"));
    });
}

TEST_F(InterruptedMoves, ofAnotherProjectLeaveItsReferencesAsTheyWereOrAsTheyShouldBe) {
    for (auto const* name : {"src/inner", "other", "place"}) {
        files::create_directory(original() / name);
        Session::create(root(original() / name), u"Another", {SourceControl::Off});
    }
    auto inner = Session::open(root(original() / "src/inner"), {SourceControl::Off});
    inner.project().getProjectReferenceManager().getFolderReferenceManager().addReferences(
        {management::relativeFolderReference(root(original() / "other"), inner.root())});

    expectOldOrNew([](Session& session, Path const& root) {
        session.move({root / Path(u"src")}, root / Path(u"place/src"));
    });
}

TEST_F(InterruptedMoves, inATransactionLeaveTheOldStateOrTheNewOne) {
    expectOldOrNew([](Session& session, Path const& root) {
        auto transaction = session.transaction();
        session.move({root / Path(u"a")}, root / Path(u"z"));
        session.move({root / Path(u"src/b")}, root / Path(u"a"));
        session.move({root / Path(u"z")}, root / Path(u"src/b"));
        transaction.commit();
    });
}

TEST_F(InterruptedMoves, whoseTextIsStagedLaterLeaveTheOldStateOrTheNewOne) {
    expectOldOrNew(
        [](Session& session, Path const& root) { session.move({root / Path(u"src")}, root / Path(u"lib")); },
        SourceControl::WhenAsked);
}

TEST_F(InterruptedMoves, aFileInTheWayOfARollBackIsReportedAndKept) {
    auto const project = original();
    for (std::size_t call = 1;; ++call) { // until the file has moved
        auto const name = test::killAtCall(
            call, [&] { Session::open(root(project)).move({root(project / "a")}, root(project / "z")); });
        ASSERT_TRUE(name);
        if (!files::exists(project / "a")) {
            break;
        }
        recover(project, SourceControl::EachChange);
    }
    std::ofstream(project / "a") << "another file";

    auto const recovered = recover(project, SourceControl::EachChange);

    ASSERT_TRUE(recovered);
    EXPECT_EQ(recovered->outcome, RecoveredMoves::Outcome::RolledBack);
    EXPECT_THAT(recovered->left, ::testing::ElementsAre(Move{root(project / "a"), root(project / "z")}));
    EXPECT_TRUE(files::exists(project / "z"));
    EXPECT_EQ(stateOf(project).disk["a"], "another file");
}

} // namespace
} // namespace project::session

#include <atomic>
#include <fstream>
#include <functional>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::EntryPointDefinition;
using management::FileManager;
using management::Label;
using management::LabelDefinition;
using management::ProjectManager;
using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

/// A project in a git repository that several threads use.
class SessionConcurrency : public ::testing::TestWithParam<SourceControl> {
protected:
    ProjectManager& project() { return session_.project(); }

    FileManager& files() { return project().getFileManager(); }

    std::string inIndex() const { return git_.run({"ls-files"}); }

    std::string stagedText() const { return git_.run({"show", ":.projectdata/project.jsonl"}); }

    std::string textOnDisk() const {
        std::ifstream file(folder_.onDisk() / ".projectdata" / "project.jsonl", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    /// Runs each action on its own thread, all at the same time.
    static void runTogether(std::vector<std::function<void()>> const& actions) {
        std::atomic<std::size_t> ready = 0;
        std::vector<std::thread> threads;
        for (auto const& action : actions) {
            threads.emplace_back([&] {
                ++ready;
                while (ready < actions.size()) {
                    std::this_thread::yield();
                }
                action();
            });
        }
        for (auto& thread : threads) {
            thread.join();
        }
    }

    test::TemporaryFolder const folder_;
    test::GitFolder const git_{folder_.onDisk()};
    Session session_ = Session::create(folder_.root(), u"Engine", {.sourceControl = GetParam()});
};

TEST_P(SessionConcurrency, threadsThatChangeTheProjectStageTheLastState) {
    constexpr int changes = 30;
    auto const file = folder_.file(u"a");
    files().add({file});
    std::atomic<int> events = 0;
    session_.events()->onNameChanged([&events] { ++events; });

    runTogether({[&] {
                     for (int number = 0; number < changes; ++number) {
                         project().setName(number % 2 == 0 ? u"Pump" : u"Valve");
                     }
                 },
                 [&] {
                     for (int number = 0; number < changes; ++number) {
                         project().setDescription(number % 2 == 0 ? u"one" : u"two");
                     }
                 },
                 [&] {
                     for (int number = 0; number < changes; ++number) {
                         EXPECT_TRUE(files().isFileInProject(file));
                         EXPECT_FALSE(project().getName().empty());
                     }
                 }});
    session_.stage();

    EXPECT_EQ(events, changes);
    auto const onDisk = textOnDisk();
    EXPECT_EQ(stagedText(), onDisk);
    EXPECT_THAT(onDisk, AllOf(HasSubstr("Valve"), HasSubstr("two")));
}

TEST_P(SessionConcurrency, otherThreadsSeeATransactionWhollyOrNotAtAll) {
    constexpr int rounds = 20;
    auto const file = folder_.file(u"a");
    files().add({file});
    project().setDescription(u"Engine");
    std::atomic<bool> isFinished = false;
    auto const read = [&] {
        while (!isFinished) {
            auto const guard = session_.store().acquireReadLock();
            EXPECT_EQ(project().getName(), project().getDescription());
        }
    };

    runTogether({[&] {
                     for (int round = 0; round < rounds; ++round) {
                         auto transaction = session_.transaction();
                         auto const name = round % 2 == 0 ? u"Pump" : u"Valve";
                         project().setName(name);
                         project().setDescription(name);
                         if (round % 5 != 0) {
                             transaction.commit(); // the others are rolled back
                         }
                     }
                     isFinished = true;
                 },
                 [&] {
                     for (int round = 0; round < rounds; ++round) {
                         EntryPointDefinition point(file);
                         project().getEntryPointManager().setEntryPoint(point);
                         project().getEntryPointManager().removeEntryPoint(file);
                     }
                 },
                 read, read});
    session_.stage();

    EXPECT_EQ(project().getName(), u"Valve");
    EXPECT_EQ(stagedText(), textOnDisk());
}

TEST_P(SessionConcurrency, oneThreadAddsAndRemovesWhileOthersSetNamesLabelsAndEntryPoints) {
    constexpr int rounds = 15;
    auto const labelled = folder_.file(u"labelled");
    CategoryDefinition const status(u"Status");
    LabelDefinition const done(u"Done");
    files().add({labelled});
    project().getLabelManager().createCategory(status);
    std::string expected = ".projectdata/.gitattributes\n.projectdata/.gitignore\n"
                           ".projectdata/project.jsonl\nlabelled\n";
    std::vector<std::pair<Path, Path>> pairs;
    for (char16_t letter = u'a'; letter < u'a' + rounds; ++letter) {
        auto const name = u"src/" + std::u16string(1, letter);
        pairs.emplace_back(folder_.file(name + u"-kept"), folder_.file(name + u"-removed"));
        expected += std::string("src/") + static_cast<char>(letter) + "-kept\n";
    }

    runTogether({[&] {
                     for (auto const& [kept, removed] : pairs) {
                         files().add({kept, removed});
                         files().remove({removed});
                     }
                 },
                 [&] {
                     for (int round = 0; round < rounds; ++round) {
                         project().setName(round % 2 == 0 ? u"Pump" : u"Valve");
                     }
                 },
                 [&] {
                     for (int round = 0; round < rounds; ++round) {
                         project().getLabelManager().createLabel(status, done);
                         files().addLabels({labelled}, {Label(status, done)});
                         project().getLabelManager().deleteLabel(status, done);
                     }
                 },
                 [&] {
                     for (int round = 0; round < rounds; ++round) {
                         EntryPointDefinition point(labelled);
                         project().getEntryPointManager().setEntryPoint(point);
                         project().getEntryPointManager().removeEntryPoint(labelled);
                     }
                 }});
    session_.stage();

    EXPECT_EQ(inIndex(), expected);
    EXPECT_EQ(stagedText(), textOnDisk());
    for (auto const& [kept, removed] : pairs) {
        EXPECT_TRUE(files().isFileInProject(kept));
        EXPECT_FALSE(files().isFileInProject(removed));
    }
}

/// While this thread holds the store's guard, another thread's add or remove waits. Writes of this thread
/// must not stage, or remove from the index, the paths of that operation: it may still be refused.
class WaitingOperation : public SessionConcurrency {
protected:
    /// Changes names and labels while another thread tries to run the action. @return git's index
    /// meanwhile.
    std::string inIndexWhileWaiting(std::function<void()> const& action) {
        CategoryDefinition const status(u"Status");
        LabelDefinition const done(u"Done");
        std::atomic<bool> hasStarted = false;
        std::string result;
        std::thread other;
        {
            auto const guard = session_.store().acquireWriteLock();
            project().getLabelManager().createCategory(status);
            other = std::thread([&] {
                hasStarted = true;
                action();
            });
            while (!hasStarted) {
                std::this_thread::yield();
            }
            // Each write gives the other thread time to proceed as far as it can.
            for (int write = 0; write < 50; ++write) {
                project().setName(write % 2 == 0 ? u"Pump" : u"Valve");
                project().getLabelManager().createLabel(status, done);
                project().getLabelManager().deleteLabel(status, done);
            }
            result = inIndex();
        }
        other.join();
        return result;
    }
};

TEST_P(WaitingOperation, addsNothingToGitBeforeItsTurn) {
    auto const file = folder_.file(u"later");

    EXPECT_THAT(inIndexWhileWaiting([&] { files().add({file}); }), Not(HasSubstr("later")));
    EXPECT_THAT(inIndex(), HasSubstr("later"));
}

TEST_P(WaitingOperation, removesNothingFromGitBeforeItsTurn) {
    auto const file = folder_.file(u"removed");
    files().add({file});

    EXPECT_THAT(inIndexWhileWaiting([&] { files().remove({file}); }), HasSubstr("removed"));
    EXPECT_THAT(inIndex(), Not(HasSubstr("removed")));
}

auto nameOfMode(::testing::TestParamInfo<SourceControl> const& info) {
    return std::string(info.param == SourceControl::EachChange ? "EachChange" : "WhenAsked");
}

INSTANTIATE_TEST_SUITE_P(Modes, SessionConcurrency,
                         ::testing::Values(SourceControl::EachChange, SourceControl::WhenAsked), nameOfMode);
INSTANTIATE_TEST_SUITE_P(Modes, WaitingOperation,
                         ::testing::Values(SourceControl::EachChange, SourceControl::WhenAsked), nameOfMode);

} // namespace
} // namespace project::session

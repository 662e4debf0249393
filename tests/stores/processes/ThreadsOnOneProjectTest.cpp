#include <algorithm>
#include <atomic>
#include <mutex>
#include <set>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

/// The files that a session's events reported, on any thread.
class ReportedFiles {
public:
    explicit ReportedFiles(Session& session) {
        session.events()->onFileListUpdate([this](std::vector<Path> const& files) {
            std::lock_guard const guard(mutex_);
            files_.insert(files.begin(), files.end());
        });
    }

    bool contains(Path const& file) const {
        std::lock_guard const guard(mutex_);
        return files_.contains(file);
    }

private:
    mutable std::mutex mutex_;
    std::set<Path> files_;
};

/// Threads that share one session of a project, and others that have sessions of their own.
class ThreadsOnOneProject : public ::testing::Test {
protected:
    static constexpr int filesOfEach = 12;
    static constexpr int sessionsOfTheirOwn = 3;

    Path fileOf(std::u16string const& prefix, int number) const {
        return folder_.path(prefix + static_cast<char16_t>(u'a' + number));
    }

    void addFiles(Session& session, std::u16string const& prefix) const {
        for (int number = 0; number < filesOfEach; ++number) {
            session.project().getFileManager().add({fileOf(prefix, number)});
        }
    }

    static std::u16string nameOf(int owner) {
        return u"own " + std::u16string(1, static_cast<char16_t>(u'0' + owner));
    }

    /// Two values that one thread sets in one step.
    static void nameInOneStep(Session& session) {
        for (int number = 0; number < filesOfEach; ++number) {
            auto const guard = session.store().acquireWriteLock();
            std::u16string const value = number % 2 == 0 ? u"Pump" : u"Valve";
            session.project().setName(value);
            session.project().setDescription(value);
        }
    }

    test::TemporaryFolder folder_;
    Options const withoutGit_{SourceControl::Off, false};
    Session session_ = Session::create(folder_.root(), u"Pump", withoutGit_);
    std::atomic<int> running_ = 0;

    std::thread start(std::function<void()> const& act) {
        ++running_;
        return std::thread([this, act] {
            act();
            --running_;
        });
    }
};

TEST_F(ThreadsOnOneProject, loseNothingAndSeeEveryEvent) {
    for (auto const& prefix : {std::u16string(u"shared "), nameOf(0), nameOf(1), nameOf(2)}) {
        for (int number = 0; number < filesOfEach; ++number) {
            folder_.file(prefix + static_cast<char16_t>(u'a' + number));
        }
    }
    session_.project().setDescription(u"Pump");
    ReportedFiles const reported(session_);
    std::atomic<int> names = 0;
    session_.events()->onNameChanged([&names] { ++names; });

    std::vector<std::thread> threads;
    threads.push_back(start([this] { addFiles(session_, u"shared "); }));
    threads.push_back(start([this] { nameInOneStep(session_); }));
    for (int owner = 0; owner < sessionsOfTheirOwn; ++owner) {
        threads.push_back(start([this, owner] {
            auto own = Session::open(folder_.root(), withoutGit_);
            ReportedFiles const ownReported(own);
            addFiles(own, nameOf(owner));
            own.refresh();
            EXPECT_TRUE(ownReported.contains(fileOf(nameOf(owner), 0)));
        }));
    }
    std::vector<std::thread> lookers;
    lookers.emplace_back([this] {
        while (running_ > 0) {
            session_.refresh();
        }
    });
    lookers.emplace_back([this] {
        while (running_ > 0) {
            auto const guard = session_.store().acquireReadLock();
            EXPECT_EQ(session_.project().getName(), session_.project().getDescription());
        }
    });
    for (auto* group : {&threads, &lookers}) {
        std::for_each(group->begin(), group->end(), [](std::thread& thread) { thread.join(); });
    }
    session_.refresh();

    auto fresh = Session::open(folder_.root(), withoutGit_);
    for (auto const& prefix : {std::u16string(u"shared "), nameOf(0), nameOf(1), nameOf(2)}) {
        for (int number = 0; number < filesOfEach; ++number) {
            auto const file = fileOf(prefix, number);
            EXPECT_TRUE(fresh.project().getFileManager().isFileInProject(file));
            EXPECT_TRUE(reported.contains(file));
        }
    }
    EXPECT_GE(names, filesOfEach);
}

} // namespace
} // namespace project::session

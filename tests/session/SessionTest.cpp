#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "project/stores/StoreError.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

std::string messageOf(std::function<void()> const& action) {
    try {
        action();
    } catch (stores::StoreError const& error) {
        return error.what();
    }
    return "nothing was thrown";
}

class Sessions : public ::testing::Test {
protected:
    test::TemporaryFolder folder_;
};

TEST_F(Sessions, makeAProjectThatIsThereWhenItIsOpenedAgain) {
    auto const file = folder_.file(u"a");
    {
        auto session = Session::make(folder_.root(), u"Engine");
        session.project().getFileManager().add({file});
    }

    auto session = Session::open(folder_.root());

    EXPECT_EQ(session.project().getName(), u"Engine");
    EXPECT_THAT(session.project().getFileManager().getProjectFiles(), ElementsAre(file));
}

TEST_F(Sessions, openNothingWhereThereIsNoProject) {
    EXPECT_THAT(messageOf([&] { Session::open(folder_.root()); }),
                HasSubstr("there is no project in this folder"));
    EXPECT_FALSE(std::filesystem::exists(folder_.onDisk() / ".projectdata"));
}

TEST_F(Sessions, makeNoSecondProjectInAFolder) {
    Session::make(folder_.root(), u"Engine");

    EXPECT_THAT(messageOf([&] { Session::make(folder_.root(), u"Pump"); }),
                HasSubstr("there is a project in this folder already"));
    EXPECT_EQ(Session::open(folder_.root()).project().getName(), u"Engine");
}

TEST_F(Sessions, openWhatIsThereAndMakeWhatIsNot) {
    EXPECT_EQ(Session::openOrMake(folder_.root(), u"Engine").project().getName(), u"Engine");
    EXPECT_EQ(Session::openOrMake(folder_.root(), u"Pump").project().getName(), u"Engine");
}

TEST_F(Sessions, bringTheRootIntoItsCanonicalForm) {
    folder_.addFolder("engine");
    auto const link = folder_.addLink("link", "engine");

    auto const session = Session::openOrMake(fl::filesystem::fromSystem(link / "."), u"Engine");

    EXPECT_EQ(session.root(), folder_.root() / u"engine");
}

TEST_F(Sessions, tellObserversOfChangesAfterTheyAreMade) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto const file = folder_.file(u"a");
    std::vector<std::vector<Path>> seen;
    session.events()->onFileListUpdate([&](std::vector<Path> const&) {
        seen.push_back(session.project().getFileManager().getProjectFiles());
    });

    session.project().getFileManager().add({file});

    EXPECT_THAT(seen, ElementsAre(ElementsAre(file)));
}

TEST_F(Sessions, leaveTheBroadcasterToWhoeverHoldsIt) {
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> events;
    {
        auto session = Session::make(folder_.root(), u"Engine");
        events = session.events();
    }
    int calls = 0;
    events->onMetadataChange([&calls] { ++calls; });

    events->dispatchMetadataChange();

    EXPECT_EQ(calls, 1);
}

TEST_F(Sessions, holdOneStateOfTheProjectForAsLongAsAGuardIsOpen) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto other = Session::open(folder_.root());
    {
        auto const guard = session.store().acquireReadLock();
        EXPECT_EQ(session.project().getName(), u"Engine");
        other.project().setName(u"Pump");
        EXPECT_EQ(session.project().getName(), u"Engine");
    }

    EXPECT_EQ(session.project().getName(), u"Pump");
}

TEST_F(Sessions, canBeMovedWithAllThatWasHandedOut) {
    auto session = Session::make(folder_.root(), u"Engine");
    auto& project = session.project();

    Session const moved = std::move(session);

    EXPECT_EQ(project.getName(), u"Engine");
    EXPECT_EQ(moved.root(), folder_.root());
}

} // namespace
} // namespace project::session

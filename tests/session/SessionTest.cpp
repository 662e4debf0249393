#include <filesystem>
#include <functional>
#include <optional>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using stores::StoreError;
using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::ThrowsMessage;

/// Runs an action that must fail. @return the kind of its StoreError.
std::optional<StoreError::Kind> kindOfErrorIn(std::function<void()> const& action) {
    try {
        action();
    } catch (StoreError const& error) {
        return error.kind();
    }
    return std::nullopt;
}

class Sessions : public ::testing::Test {
protected:
    test::TemporaryFolder folder_;
};

TEST_F(Sessions, createAProjectThatCanBeOpenedAgain) {
    auto const file = folder_.file(u"a");
    {
        auto session = Session::create(folder_.root(), u"Engine");
        session.project().getFileManager().add({file});
    }

    auto session = Session::open(folder_.root());

    EXPECT_EQ(session.project().getName(), u"Engine");
    EXPECT_THAT(session.project().getFileManager().getProjectFiles(), ElementsAre(file));
}

TEST_F(Sessions, cannotBeOpenedWithoutAProject) {
    EXPECT_EQ(kindOfErrorIn([&] { Session::open(folder_.root()); }), StoreError::Kind::Refused);
    EXPECT_FALSE(std::filesystem::exists(folder_.onDisk() / ".projectdata"));
}

TEST_F(Sessions, doNotCreateASecondProjectInAFolder) {
    Session::create(folder_.root(), u"Engine");

    EXPECT_EQ(kindOfErrorIn([&] { Session::create(folder_.root(), u"Pump"); }), StoreError::Kind::Refused);
    EXPECT_EQ(Session::open(folder_.root()).project().getName(), u"Engine");
}

TEST_F(Sessions, openAnExistingProjectOrCreateOne) {
    EXPECT_EQ(Session::openOrCreate(folder_.root(), u"Engine").project().getName(), u"Engine");
    EXPECT_EQ(Session::openOrCreate(folder_.root(), u"Pump").project().getName(), u"Engine");
}

TEST_F(Sessions, areNotCreatedInAFolderThatDoesNotExist) {
    auto const missing = folder_.root() / u"missing";
    std::vector<std::function<void()>> const attempts = {
        [&] { Session::create(missing, u"Engine"); },
        [&] { Session::openOrCreate(missing, u"Engine"); },
        [&] {
            Session::createShared(missing, u"Engine", {"service", "reader", "writer"});
        },
    };

    for (auto const& attempt : attempts) {
        EXPECT_THAT(attempt,
                    ThrowsMessage<StoreError>(EndsWith(
                        "missing: the folder does not exist. Create the folder, or check the path.")));
    }
    EXPECT_FALSE(std::filesystem::exists(folder_.onDisk() / "missing"));
}

TEST_F(Sessions, convertTheRootToCanonicalForm) {
    folder_.addFolder("engine");
    auto const link = folder_.addLink("link", "engine");

    auto const session = Session::openOrCreate(fl::filesystem::fromSystem(link / "."), u"Engine");

    EXPECT_EQ(session.root(), folder_.root() / u"engine");
}

TEST_F(Sessions, reportChangesAfterTheyAreMade) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto const file = folder_.file(u"a");
    std::vector<std::vector<Path>> seen;
    session.events()->onFileListUpdate([&](std::vector<Path> const&) {
        seen.push_back(session.project().getFileManager().getProjectFiles());
    });

    session.project().getFileManager().add({file});

    EXPECT_THAT(seen, ElementsAre(ElementsAre(file)));
}

TEST_F(Sessions, leaveABroadcasterThatOutlivesThem) {
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> events;
    {
        auto session = Session::create(folder_.root(), u"Engine");
        events = session.events();
    }
    int calls = 0;
    events->onMetadataChange([&calls] { ++calls; });

    events->dispatchMetadataChange();

    EXPECT_EQ(calls, 1);
}

TEST_F(Sessions, showOneStateOfTheProjectWhileAGuardIsOpen) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto other = Session::open(folder_.root());
    {
        auto const guard = session.store().acquireReadLock();
        EXPECT_EQ(session.project().getName(), u"Engine");
        other.project().setName(u"Pump");
        EXPECT_EQ(session.project().getName(), u"Engine");
    }

    EXPECT_EQ(session.project().getName(), u"Pump");
}

TEST_F(Sessions, canBeMovedWhileReferencesStayValid) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto& project = session.project();

    Session const moved = std::move(session);

    EXPECT_EQ(project.getName(), u"Engine");
    EXPECT_EQ(moved.root(), folder_.root());
}

TEST_F(Sessions, canBeReplacedByOthers) {
    folder_.folder(u"pump");
    auto session = Session::create(folder_.root(), u"Engine");

    session = Session::create(folder_.path(u"pump"), u"Pump");

    EXPECT_EQ(session.project().getName(), u"Pump");
    EXPECT_EQ(session.root(), folder_.path(u"pump"));
    EXPECT_EQ(Session::open(folder_.root()).project().getName(), u"Engine");
}

} // namespace
} // namespace project::session

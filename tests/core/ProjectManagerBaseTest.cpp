#include "project/core/ProjectManagerBase.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "support/RecordingMetadataManager.hpp"

// The project's name and description, and its calls of the store. ProjectAssemblyTest.cpp tests the managers.

namespace project::management {
namespace {

using metadata::FileChangeRequestListener;
using metadata::MetadataManager;
using metadata::MetadataNode;
using metadata::MetadataPath;
using test::address;
using testing::ElementsAre;
using testing::IsEmpty;
using Guard = test::StoreCall::Guard;

MetadataPath const NAME = address({{u"Info", u"ProjectData"}});
MetadataPath const DESCRIPTION = address({{u"Root", u"Extensions"}, {u"Extension", u"Information"}});

class ProjectManagerBaseTest : public testing::Test {
protected:
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>();
    ProjectManagerBase project{u"/project", store};
};

/// Subscribes a listener, and keeps it for the test.
class SubscribingStore : public test::RecordingMetadataManager {
public:
    void subscribe(std::weak_ptr<FileChangeRequestListener> listener) override {
        RecordingMetadataManager::subscribe(listener);
        subscribed = std::move(listener);
    }

    std::weak_ptr<FileChangeRequestListener> subscribed;
};

/// A store that claims to have every node and returns none.
class ForgetfulStore : public test::RecordingMetadataManager {
public:
    bool hasNode(MetadataPath const&) override { return true; }

    std::unique_ptr<MetadataNode> getNode(MetadataPath const&) override { return nullptr; }
};

class CountingListener : public FileChangeRequestListener {
public:
    void fileRemovalRequested(MetadataManager&, Path const&, std::vector<Path> const&) override { ++calls; }

    void fileAdditionRequested(MetadataManager&, std::vector<Path> const&) override { ++calls; }

    bool acceptsFileChangeRequests() override { return true; }

    int calls = 0;
};

class RenamedProject : public ProjectManagerBase {
public:
    using ProjectManagerBase::ProjectManagerBase;

    void setName(std::u16string const& name) override { names.push_back(name); }

    std::vector<std::u16string> names;
};

TEST_F(ProjectManagerBaseTest, constructionDoesNotAccessTheStore) {
    EXPECT_THAT(store->calls(), IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(ProjectManagerBaseTest, anEmptyStoreReadsAsEmptyTextsAndStaysEmpty) {
    EXPECT_EQ(project.getName(), u"");
    EXPECT_EQ(project.getDescription(), u"");
    EXPECT_THAT(store->operations(), ElementsAre("hasNode", "hasNode"));
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(ProjectManagerBaseTest, creatingAProjectStoresItsNameAndNoDescription) {
    project.create(u"Engine");
    EXPECT_EQ(project.getName(), u"Engine");
    EXPECT_EQ(project.getDescription(), u"");
    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
}

TEST_F(ProjectManagerBaseTest, creatingAProjectUsesTheSetNameOfASubclass) {
    RenamedProject renamed(u"/project", store);
    renamed.create(u"Engine");
    EXPECT_THAT(renamed.names, ElementsAre(u"Engine"));
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(ProjectManagerBaseTest, nameAndDescriptionAreTwoNodesAndOneWriteEach) {
    project.setDescription(u"Two strokes");
    project.setName(u"Engine");
    EXPECT_EQ(project.getName(), u"Engine");
    EXPECT_EQ(project.getDescription(), u"Two strokes");

    auto const written = store->calls("setNodes");
    ASSERT_EQ(written.size(), 2U);
    EXPECT_THAT(written[0].paths, ElementsAre(DESCRIPTION));
    EXPECT_THAT(written[1].paths, ElementsAre(NAME));
}

TEST_F(ProjectManagerBaseTest, eachNodeHasOneKeyAndNoType) {
    project.setName(u"Engine");
    project.setDescription(u"Two strokes");
    auto const name = store->content().getNode(NAME);
    EXPECT_EQ(name->getType(), u"");
    EXPECT_THAT(name->getKeys(), ElementsAre(u"Name"));
    auto const description = store->content().getNode(DESCRIPTION);
    EXPECT_EQ(description->getType(), u"");
    EXPECT_THAT(description->getKeys(), ElementsAre(u"description"));
}

TEST_F(ProjectManagerBaseTest, settingANameReadsNothingAndReplacesTheNode) {
    store->put(NAME, {{u"Name", u"Old"}, {u"Other", u"1"}});
    project.setName(u"Engine");
    EXPECT_THAT(store->operations(), ElementsAre("setNodes"));
    EXPECT_THAT(store->content().getNode(NAME)->getKeys(), ElementsAre(u"Name"));
}

TEST_F(ProjectManagerBaseTest, anEmptyNameIsStoredAndReadsLikeNoName) {
    project.setName(u"");
    EXPECT_TRUE(store->content().hasNode(NAME));
    EXPECT_THAT(store->content().getNode(NAME)->getKeys(), ElementsAre(u"Name"));
    EXPECT_EQ(project.getName(), u"");
}

TEST_F(ProjectManagerBaseTest, aNodeWithoutTheKeyReadsAsTheEmptyText) {
    store->put(NAME, {{u"Other", u"1"}});
    EXPECT_EQ(project.getName(), u"");
}

TEST_F(ProjectManagerBaseTest, aNodeThatWasRemovedBeforeItIsReadIsTheEmptyText) {
    ProjectManagerBase const forgotten(u"/project", std::make_shared<ForgetfulStore>());
    EXPECT_EQ(forgotten.getName(), u"");
    EXPECT_EQ(forgotten.getDescription(), u"");
}

TEST_F(ProjectManagerBaseTest, theAddressesAreTheSameForEveryProject) {
    EXPECT_EQ(ProjectManagerBase::getRootNodePath(), NAME);
    EXPECT_EQ(ProjectManagerBase::getDescriptionNodePath(), DESCRIPTION);
}

TEST_F(ProjectManagerBaseTest, thePublicConstantsAreTheStoredTexts) {
    EXPECT_EQ(ProjectManagerBase::NAME_FIELD, u"Name");
    EXPECT_EQ(ProjectManagerBase::DESCRIPTION_FIELD, u"description");
    EXPECT_EQ(ProjectManagerBase::ROOT_METADATA, u"ProjectData");
    EXPECT_EQ(ProjectManagerBase::ROOT_EXTENSTION, u"Extensions");
    EXPECT_EQ(ProjectManagerBase::TYPE_EXTENSTION, u"Extension");
    EXPECT_EQ(ProjectManagerBase::INFORMATION, u"Information");
}

TEST_F(ProjectManagerBaseTest, queriesReadAndChangesWriteUnderOneGuard) {
    project.setName(u"Engine");
    project.getName();
    std::vector<std::pair<std::string, Guard>> calls;
    for (auto const& call : store->calls()) {
        calls.emplace_back(call.operation, call.guard);
    }
    EXPECT_THAT(calls,
                ElementsAre(std::pair("acquireWriteLock", Guard::None), std::pair("setNodes", Guard::Write),
                            std::pair("acquireReadLock", Guard::None), std::pair("hasNode", Guard::Read),
                            std::pair("getNode", Guard::Read)));
}

TEST_F(ProjectManagerBaseTest, anExceptionOfTheStorePropagatesAndTheGuardIsReleased) {
    store->failOn("setNodes", [] { throw std::runtime_error("disk full"); });
    EXPECT_THROW(project.setDescription(u"Two strokes"), std::runtime_error);
    store->clear();
    project.getName();
    EXPECT_EQ(store->calls().at(0).guard, Guard::None);
}

TEST_F(ProjectManagerBaseTest, aListenerIsNotifiedOfLaterWrites) {
    auto const listener = std::make_shared<CountingListener>();
    project.setName(u"Engine");
    project.subscribe(listener);
    EXPECT_EQ(listener->calls, 0);
    project.setName(u"Motor");
    EXPECT_EQ(listener->calls, 1);
}

TEST_F(ProjectManagerBaseTest, aListenerIsPassedToTheStoreWithoutTakingTheLock) {
    auto const subscribing = std::make_shared<SubscribingStore>();
    ProjectManagerBase subscribed(u"/project", subscribing);
    auto listener = std::make_shared<CountingListener>();
    std::weak_ptr<FileChangeRequestListener> const expired = listener;
    listener.reset();
    subscribed.subscribe(expired);

    ASSERT_EQ(subscribing->calls().size(), 1U);
    EXPECT_EQ(subscribing->calls().at(0).operation, "subscribe");
    // The same pointer, although its object was destroyed.
    EXPECT_FALSE(subscribing->subscribed.owner_before(expired) ||
                 expired.owner_before(subscribing->subscribed));
    EXPECT_TRUE(expired.owner_before(std::weak_ptr<int>()) || std::weak_ptr<int>().owner_before(expired));
}

} // namespace
} // namespace project::management

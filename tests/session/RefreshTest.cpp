#include <fstream>
#include <functional>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextBackend.hpp"
#include "support/EventLog.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::EntryPointDefinition;
using management::EntryPointGroupDefinition;
using management::FileManager;
using management::Label;
using management::LabelDefinition;
using management::LabelManager;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using Lines = std::vector<std::u16string>;

/// A session that observes a project, and another one that changes it.
class Refresh : public ::testing::Test {
protected:
    Refresh() {
        files().add({engine_, pump_, valve_});
        labels().createCategory(status_);
        labels().createLabel(status_, done_);
        refresh();
        log_.take();
    }

    FileManager& files() { return other_.project().getFileManager(); }

    LabelManager& labels() { return other_.project().getLabelManager(); }

    /// Refreshes the observing session. @return its events.
    Lines refresh() {
        session_.refresh();
        return log_.take();
    }

    /// Runs an action in the other session and refreshes the observing one. @return its events.
    Lines eventsOf(std::function<void()> const& action) {
        action();
        return refresh();
    }

    std::u16string at(std::u16string const& path) const { return folder_.path(path).native(); }

    Label label() const { return Label(status_, done_); }

    test::TemporaryFolder folder_;
    Session other_ = Session::create(folder_.root(), u"Engine");
    Session session_ = Session::open(folder_.root());
    test::EventLog log_{*session_.events()};
    Path const engine_ = folder_.file(u"src/engine.cpp");
    Path const pump_ = folder_.file(u"src/io/pump.cpp");
    Path const valve_ = folder_.file(u"valve.cpp");
    CategoryDefinition status_ = CategoryDefinition(u"Status", u"status");
    LabelDefinition done_ = LabelDefinition(u"Done", u"done");
};

TEST_F(Refresh, reportsNothingIfNothingHasChanged) {
    EXPECT_FALSE(session_.refresh());
    EXPECT_THAT(log_.take(), IsEmpty());
}

TEST_F(Refresh, doesNotReportTheStateBeforeTheFirstRead) {
    auto fresh = Session::open(folder_.root());
    test::EventLog log(*fresh.events());

    EXPECT_FALSE(fresh.refresh());
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(Refresh, doesNotReportChangesOfTheSessionItself) {
    session_.project().setName(u"Pump");
    session_.project().getFileManager().remove({engine_});
    log_.take();

    EXPECT_THAT(refresh(), IsEmpty());
}

TEST_F(Refresh, reportsFilesThatWereAddedAndRemoved) {
    auto const tank = folder_.file(u"src/tank.cpp");
    files().add({tank});
    files().remove({valve_});

    EXPECT_THAT(refresh(), ElementsAre(u"fileListUpdate " + at(u"src/tank.cpp") + u" " + at(u"valve.cpp")));
}

TEST_F(Refresh, reportsFoldersLikeFiles) {
    EXPECT_THAT(eventsOf([&] { files().remove({folder_.path(u"src/io")}); }),
                ElementsAre(u"fileListUpdate " + at(u"src/io") + u" " + at(u"src/io/pump.cpp")));
}

TEST_F(Refresh, reportsFilesWhoseLabelsChanged) {
    auto const changed = u"fileLabelsChanged " + at(u"src/engine.cpp") + u" " + at(u"src/io");

    EXPECT_THAT(eventsOf([&] {
                    files().addLabels({engine_, folder_.path(u"src/io")}, {label()});
                }),
                ElementsAre(changed));
    EXPECT_THAT(eventsOf([&] {
                    files().removeLabels({engine_, folder_.path(u"src/io")}, {label()});
                }),
                ElementsAre(changed));
}

TEST_F(Refresh, reportsAFileThatWasAddedWithLabelsTwice) {
    auto const tank = folder_.file(u"tank.cpp");
    files().add({tank});
    files().addLabels({tank}, {label()});

    EXPECT_THAT(refresh(),
                ElementsAre(u"fileListUpdate " + at(u"tank.cpp"), u"fileLabelsChanged " + at(u"tank.cpp")));
}

TEST_F(Refresh, reportsALabelledFileThatWasRemovedOnce) {
    files().addLabels({valve_}, {label()});
    refresh();

    EXPECT_THAT(eventsOf([&] { files().remove({valve_}); }),
                ElementsAre(u"fileListUpdate " + at(u"valve.cpp")));
}

TEST_F(Refresh, reportsCategoriesThatWereCreatedRenamedAndDeleted) {
    auto const owner = CategoryDefinition(u"Owner", u"owner");

    EXPECT_THAT(eventsOf([&] { labels().createCategory(owner); }), ElementsAre(u"categoryAdded owner Owner"));
    EXPECT_THAT(eventsOf([&] { labels().renameCategory(owner, u"Keeper"); }),
                ElementsAre(u"categoryRenamed owner Owner"));
    EXPECT_THAT(eventsOf([&] { labels().deleteCategory(owner); }),
                ElementsAre(u"categoryDeleted owner Keeper"));
}

TEST_F(Refresh, reportsACategoryWithOtherFlagsAsAdded) {
    auto single = CategoryDefinition(u"State", u"status");
    single.setIsSingleValued(true);

    EXPECT_THAT(eventsOf([&] { labels().createCategory(single); }),
                ElementsAre(u"categoryAdded status State"));
}

TEST_F(Refresh, reportsEachOtherFlagOfACategoryAsAdded) {
    auto readOnly = CategoryDefinition(u"State", u"status");
    readOnly.setIsReadOnly(true);
    auto dated = CategoryDefinition(u"Due", u"due");
    labels().createCategory(CategoryDefinition(u"Owner", u"due"));
    refresh();

    EXPECT_THAT(eventsOf([&] { labels().createCategory(readOnly); }),
                ElementsAre(u"categoryAdded status State"));
    EXPECT_THAT(eventsOf([&] { labels().createCategory(dated.setDataType(u"Date")); }),
                ElementsAre(u"categoryAdded due Due"));
}

TEST_F(Refresh, reportsLabelsThatWereCreatedAndDeleted) {
    auto const open = LabelDefinition(u"Open", u"open");

    EXPECT_THAT(eventsOf([&] { labels().createLabel(status_, open); }),
                ElementsAre(u"labelModified status open"));
    EXPECT_THAT(eventsOf([&] { labels().deleteLabel(status_, open); }),
                ElementsAre(u"labelModified status open"));
}

TEST_F(Refresh, reportsTheNameOfADeletedLabel) {
    std::u16string name;
    session_.events()->onLabelModified(
        [&](Label const& label) { name = label.getLabelIdentifier().getName(); });

    eventsOf([&] { labels().deleteLabel(status_, done_); });

    EXPECT_EQ(name, u"Done");
}

TEST_F(Refresh, reportsADeletedCategoryAndTheFilesThatHadItsLabels) {
    files().addLabels({valve_}, {label()});
    refresh();

    EXPECT_THAT(eventsOf([&] { labels().deleteCategory(status_); }),
                ElementsAre(u"categoryDeleted status Status", u"fileLabelsChanged " + at(u"valve.cpp")));
}

TEST_F(Refresh, reportsANewCategoryWithItsLabels) {
    auto const owner = CategoryDefinition(u"Owner", u"owner");
    labels().createCategory(owner);
    labels().createLabel(owner, LabelDefinition(u"Ada", u"ada"));

    EXPECT_THAT(refresh(), ElementsAre(u"categoryAdded owner Owner", u"labelModified owner ada"));
}

TEST_F(Refresh, reportsPartsThatHaveASingleEvent) {
    auto& project = other_.project();
    auto point = EntryPointDefinition(engine_);
    auto const target = folder_.folder(u"lib");

    EXPECT_THAT(eventsOf([&] { project.setName(u"Pump"); }), ElementsAre(u"nameChanged"));
    EXPECT_THAT(eventsOf([&] { project.getEntryPointManager().setEntryPoint(point); }),
                ElementsAre(u"entryPointsChanged"));
    EXPECT_THAT(eventsOf([&] {
                    project.getEntryPointManager().createEntryPointGroup(EntryPointGroupDefinition(u"Tests"));
                }),
                ElementsAre(u"entryPointsChanged"));
    EXPECT_THAT(eventsOf([&] {
                    project.getProjectPathManager().getFolderReferenceManager().addReferences(
                        {management::relativeFolderReference(target, folder_.root())});
                }),
                ElementsAre(u"pathChanged"));
    EXPECT_THAT(eventsOf([&] {
                    project.getProjectReferenceManager().getFolderReferenceManager().addReferences(
                        {management::absoluteFolderReference(target)});
                }),
                ElementsAre(u"referencesChanged"));
}

TEST_F(Refresh, reportsAnyOtherChangeAsMetadataChange) {
    EXPECT_THAT(eventsOf([&] { other_.project().setDescription(u"Pumps water"); }),
                ElementsAre(u"metadataChange"));
    EXPECT_THAT(eventsOf([&] {
                    files().getFileMetadataManagerFor(u"Notes")->setFileNodes(
                        {{engine_, std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}});
                }),
                ElementsAre(u"metadataChange"));
}

TEST_F(Refresh, reportsAnUnreadableLabelAsMetadataChange) {
    auto const address = metadata::MetadataPathBuilder()
                             .add(u"Categories", u"Root")
                             .add(u"Category", u"status")
                             .add(u"Label", u"odd")
                             .build();
    auto const node = std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
    node->put(u"ReadOnly", u"perhaps");
    std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> nodes{{address, node}};

    EXPECT_THAT(eventsOf([&] { other_.store().setNodes(nodes); }), ElementsAre(u"metadataChange"));
}

TEST_F(Refresh, reportsNodesThatBelongToNoManagerAsMetadataChange) {
    auto const category = metadata::MetadataPathBuilder().add(u"Categories", u"Root").build();
    auto const label = metadata::MetadataPathBuilder()
                           .add(category)
                           .add(u"Category", u"status")
                           .add(u"Label", u"done")
                           .build();
    auto const belowLabel = metadata::MetadataPathBuilder().add(label).add(u"Note", u"1").build();
    auto const otherType = metadata::MetadataPathBuilder().add(u"Notes", u"Root").build();
    auto const otherScope = metadata::MetadataPathBuilder().add(u"Files", u"Notes").build();
    for (auto const& address : {category, belowLabel, otherType, otherScope}) {
        std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> nodes{
            {address, std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}};
        EXPECT_THAT(eventsOf([&] { other_.store().setNodes(nodes); }), ElementsAre(u"metadataChange"));
    }
}

TEST_F(Refresh, reportsAKeyOfACategoryThatNoManagerReadsAsMetadataChange) {
    auto const address =
        metadata::MetadataPathBuilder().add(u"Categories", u"Root").add(u"Category", u"status").build();
    std::shared_ptr<metadata::MetadataNode> const node = other_.store().getNode(address);
    node->put(u"Colour", u"red");
    std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> nodes{{address, node}};

    EXPECT_THAT(eventsOf([&] { other_.store().setNodes(nodes); }), ElementsAre(u"metadataChange"));
}

TEST_F(Refresh, reportsAKeyBesideTheNameAsMetadataChange) {
    auto const address = management::ProjectManagerBase::getRootNodePath();
    std::shared_ptr<metadata::MetadataNode> const node = other_.store().getNode(address);
    node->put(u"Colour", u"red");
    std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> nodes{{address, node}};

    EXPECT_THAT(eventsOf([&] { other_.store().setNodes(nodes); }), ElementsAre(u"metadataChange"));
}

TEST_F(Refresh, reportsANameThatIsRemoved) {
    std::vector<metadata::MetadataPath> name{management::ProjectManagerBase::getRootNodePath()};

    EXPECT_THAT(eventsOf([&] { other_.store().removeNodes(name); }), ElementsAre(u"nameChanged"));
}

TEST_F(Refresh, reportsEverythingSinceThePreviousCallAsOneChange) {
    auto const tank = folder_.file(u"tank.cpp");
    files().add({tank});
    EXPECT_TRUE(session_.project().getFileManager().isFileInProject(tank)); // seen, but not reported
    other_.project().setName(u"Pump");
    files().remove({tank});

    EXPECT_THAT(refresh(), ElementsAre(u"nameChanged"));
}

TEST_F(Refresh, reportsChangesOfAProgramThatTakesNoLock) {
    auto const text = folder_.onDisk() / ".projectdata" / "project.jsonl";
    auto const before = std::filesystem::file_size(text);
    std::ifstream file(text, std::ios::binary);
    std::string bytes{std::istreambuf_iterator<char>(file), {}};
    bytes.replace(bytes.find("valve.cpp"), 5, "gauge");
    std::ofstream(text, std::ios::binary) << bytes;
    ASSERT_EQ(std::filesystem::file_size(text), before);

    EXPECT_THAT(refresh(), ElementsAre(u"fileListUpdate " + at(u"gauge.cpp") + u" " + at(u"valve.cpp")));
}

TEST_F(Refresh, letsASlotUseTheProjectAndRefreshItAgain) {
    bool hasRefreshed = false;
    session_.events()->onNameChanged([&] {
        session_.project().setDescription(u"seen");
        other_.project().getFileManager().remove({valve_});
        hasRefreshed = session_.refresh();
    });

    other_.project().setName(u"Pump");
    auto const lines = refresh();

    EXPECT_TRUE(hasRefreshed);
    EXPECT_THAT(lines, ElementsAre(u"nameChanged", u"fileListUpdate " + at(u"valve.cpp")));
}

TEST_F(Refresh, dispatchesTheRemainingEventsWithTheNextCallAfterASlotHasThrown) {
    bool isBroken = true;
    session_.events()->onNameChanged([&] {
        if (isBroken) {
            throw std::runtime_error("a slot failed");
        }
    });
    other_.project().setName(u"Pump");
    files().remove({valve_});

    EXPECT_THROW(session_.refresh(), std::runtime_error);
    EXPECT_THAT(log_.take(), ElementsAre(u"nameChanged"));
    isBroken = false;
    EXPECT_THAT(refresh(), ElementsAre(u"fileListUpdate " + at(u"valve.cpp")));
}

TEST_F(Refresh, seesNothingNewWhileAGuardIsOpen) {
    {
        auto const guard = session_.store().acquireReadLock();
        other_.project().setName(u"Pump");
        EXPECT_THAT(refresh(), IsEmpty());
    }

    EXPECT_THAT(refresh(), ElementsAre(u"nameChanged"));
}

TEST_F(Refresh, throwsForAnUnreadableTextAndReportsTheChangesLater) {
    auto const text = folder_.onDisk() / ".projectdata" / "project.jsonl";
    auto const aside = folder_.onDisk() / "aside";
    other_.project().setName(u"Pump");
    std::filesystem::rename(text, aside);
    std::ofstream(text) << "hello\n";

    EXPECT_THROW(session_.refresh(), stores::StoreError);
    EXPECT_THAT(log_.take(), IsEmpty());
    std::filesystem::rename(aside, text);
    EXPECT_THAT(refresh(), ElementsAre(u"nameChanged"));
}

} // namespace
} // namespace project::session

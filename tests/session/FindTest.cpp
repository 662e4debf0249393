#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <future>
#include <random>

#include "project/session.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::EntryPointDefinition;
using management::Label;
using management::LabelDefinition;
using testing::ElementsAre;
using testing::IsEmpty;

/// A project with labelled files and an entry point.
class FindTest : public testing::Test {
protected:
    void SetUp() override {
        auto& labels = project_.getLabelManager();
        labels.createCategory(status_);
        labels.createLabel(status_, open_.getLabelIdentifier());
        labels.createLabel(status_, done_.getLabelIdentifier());
        labels.createCategory(owner_);
        labels.createLabel(owner_, ann_.getLabelIdentifier());
        for (auto const* name : {u"src/io/pump.cpp", u"src/main.cpp", u"src.txt"}) {
            project_.getFileManager().add({folder_.file(name)});
        }
        project_.getFileManager().addLabels({folder_.path(u"src/main.cpp"), folder_.path(u"src")}, {open_});
        project_.getFileManager().addLabels({folder_.path(u"src.txt")}, {done_, ann_});
        EntryPointDefinition entry(folder_.path(u"src/main.cpp"));
        project_.getEntryPointManager().setEntryPoint(entry);
    }

    std::vector<std::u16string> found(Query const& query) {
        std::vector<std::u16string> result;
        for (auto const& file : session_.find(query)) {
            result.push_back(metadata::getRelativePath(session_.root(), file.path));
        }
        return result;
    }

    static LabelChoice choice(Label const& label) { return {label.getCategory().getUUID(), label.getUUID()}; }

    test::TemporaryFolder folder_;
    Session session_ = Session::create(folder_.root(), u"Engine", {SourceControl::Off});
    management::ProjectManager& project_ = session_.project();
    CategoryDefinition status_{u"Status"};
    CategoryDefinition owner_{u"Owner"};
    Label open_{status_, LabelDefinition(u"Open")};
    Label done_{status_, LabelDefinition(u"Done")};
    Label ann_{owner_, LabelDefinition(u"Ann")};
};

TEST_F(FindTest, aQueryWithoutConditionsFindsAllFilesWithTheirKindsInTheOrderOfPath) {
    EXPECT_THAT(session_.find({}), ElementsAre(FoundFile{folder_.path(u"src"), FileKind::Folder},
                                               FoundFile{folder_.path(u"src/io"), FileKind::Folder},
                                               FoundFile{folder_.path(u"src/io/pump.cpp"), FileKind::File},
                                               FoundFile{folder_.path(u"src/main.cpp"), FileKind::File},
                                               FoundFile{folder_.path(u"src.txt"), FileKind::File}));
}

TEST_F(FindTest, eachConditionSelects) {
    EXPECT_THAT(found({.labels = {choice(open_)}}), ElementsAre(u"src", u"src/main.cpp"));
    EXPECT_THAT(found({.labels = {{status_.getUUID(), {}}}}),
                ElementsAre(u"src", u"src/main.cpp", u"src.txt"));
    EXPECT_THAT(found({.absentLabels = {choice(open_)}}),
                ElementsAre(u"src/io", u"src/io/pump.cpp", u"src.txt"));
    EXPECT_THAT(found({.kind = FileKind::Folder}), ElementsAre(u"src", u"src/io"));
    EXPECT_THAT(found({.glob = u"src/*"}), ElementsAre(u"src/io", u"src/main.cpp"));
    EXPECT_THAT(found({.isEntryPoint = true}), ElementsAre(u"src/main.cpp"));
    EXPECT_THAT(found({.isUnlabelled = true}), ElementsAre(u"src/io", u"src/io/pump.cpp"));
}

TEST_F(FindTest, allConditionsMustHold) {
    EXPECT_THAT(found({.labels = {choice(open_)}, .kind = FileKind::File}), ElementsAre(u"src/main.cpp"));
    EXPECT_THAT(found({.labels = {choice(done_), choice(ann_)}}), ElementsAre(u"src.txt"));
    EXPECT_THAT(found({.labels = {choice(open_), choice(ann_)}}), IsEmpty());
    EXPECT_THAT(found({.labels = {{status_.getUUID(), {}}}, .absentLabels = {choice(open_)}}),
                ElementsAre(u"src.txt"));
}

TEST_F(FindTest, severalPathsAreFoundOnceEachInTheOrderOfTheStore) {
    EXPECT_THAT(found({.paths = {folder_.path(u"src.txt"), folder_.path(u"src/io"),
                                 folder_.path(u"src/io/pump.cpp")}}),
                ElementsAre(u"src/io", u"src/io/pump.cpp", u"src.txt"));
    EXPECT_THAT(found({.paths = {session_.root()}, .kind = FileKind::Folder}),
                ElementsAre(u"src", u"src/io"));
}

TEST_F(FindTest, nothingIsFoundBelowAPathThatIsNotInTheProject) {
    EXPECT_THAT(found({.paths = {folder_.path(u"other")}}), IsEmpty());
    EXPECT_THAT(found({.paths = {folder_.path(u"../src")}}), IsEmpty());
    EXPECT_THAT(found({.paths = {Path(u"/")}}), IsEmpty());
}

TEST_F(FindTest, aTransactionSeesItsOwnChanges) {
    auto transaction = session_.transaction();
    project_.getFileManager().add({folder_.file(u"new")});
    project_.getFileManager().remove({folder_.path(u"src")});
    EXPECT_THAT(found({}), ElementsAre(u"new", u"src.txt"));
}

TEST_F(FindTest, noLockIsHeldWhenTheResultsAreReturned) {
    auto const result = session_.find({});
    std::async(std::launch::async, [this] {
        project_.setName(u"changed by another thread");
    }).get(); // would wait forever for a guard
    EXPECT_EQ(project_.getName(), u"changed by another thread");
}

TEST_F(FindTest, theResultIsTheSameWhenTheManagersHaveReadTheProject) {
    auto const cold = Session::open(folder_.root(), {SourceControl::Off}).find({.glob = u"**/*p*"});
    project_.getFileManager().getProjectFiles();
    EXPECT_EQ(session_.find({.glob = u"**/*p*"}), cold);
    EXPECT_EQ(cold.size(), 2U);
}

/// On random projects: what the managers say about each file decides.
TEST_F(FindTest, agreesWithTheManagersOnRandomProjects) {
    std::mt19937 random(7); // NOLINT(cert-msc51-cpp): the same in every run
    auto const below = [&random](std::size_t limit) {
        return std::uniform_int_distribution<std::size_t>(0, limit - 1)(random);
    };
    std::vector<Label> const labels{open_, done_, ann_};
    auto& files = project_.getFileManager();
    for (int step = 0; step < 150; ++step) {
        auto const name = std::u16string(1, static_cast<char16_t>(u'a' + below(4)));
        auto const path = folder_.path(below(2) == 0 ? name : u"src/" + name + u"/x");
        if (files.isFileInProject(path) && below(3) == 0) {
            files.remove({path});
        } else {
            folder_.file(metadata::getRelativePath(session_.root(), path) + u"/y");
            files.add({path / Path(u"y")});
            files.addLabels({path}, {labels[below(labels.size())]});
        }
        Query query;
        if (below(2) == 0) {
            query.labels.push_back(choice(labels[below(3)]));
        }
        if (below(3) == 0) {
            query.absentLabels.push_back({owner_.getUUID(), {}});
        }
        if (below(3) == 0) {
            query.kind = below(2) == 0 ? FileKind::File : FileKind::Folder;
        }
        query.isUnlabelled = below(4) == 0;
        std::vector<FoundFile> expected;
        for (auto const& file : files.getProjectFiles()) {
            auto const sets = files.getLabelIDSets(file);
            auto const has = [&sets](LabelChoice const& wanted) {
                return std::ranges::any_of(sets, [&wanted](auto const& set) {
                    return set.getCategoryUUID() == wanted.categoryUUID &&
                           (wanted.labelUUID.empty() || set.getLabelUUID() == wanted.labelUUID);
                });
            };
            auto const kind = metadata::is_directory(file) ? FileKind::Folder : FileKind::File;
            if (std::ranges::all_of(query.labels, has) && std::ranges::none_of(query.absentLabels, has) &&
                (!query.kind || query.kind == kind) && (!query.isUnlabelled || sets.empty())) {
                expected.push_back({file, kind});
            }
        }
        std::ranges::sort(expected, std::less<>(), &FoundFile::path);
        ASSERT_EQ(session_.find(query), expected) << "step " << step;
    }
}

} // namespace
} // namespace project::session

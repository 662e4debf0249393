#include "project/decorators/FileManagerDecorator.hpp"

#include <stdexcept>
#include <utility>

#include <gmock/gmock.h>

#include "support/ManagerMocks.hpp"

namespace project::management {
namespace {

using testing::ByMove;
using testing::Ref;
using testing::Return;
using testing::StrictMock;
using testing::Throw;
using Paths = std::vector<Path>;

class FileManagerDecoratorTest : public testing::Test {
protected:
    StrictMock<test::MockFileManager> inner;
    FileManagerDecorator files{inner};

    Path const path = u"/p/a";
    Paths const given{u"/p/b", u"/p/a"};
    Paths const answered{u"/p/c", u"/p/d"};
    CategoryDefinition const category{u"Kind", u"c"};
    std::vector<Label> const labels{Label(category, LabelDefinition(u"Source", u"l"))};
    std::vector<FileLabel> const fileLabels{
        FileLabel(category, LabelDefinition(u"Source", u"m"), u"/p/e", u"data")};
};

/// Objects of it differ only by their address.
class SomeFileMetadataManager : public FileMetadataManager {
public:
    void setFileNodes(std::map<Path, std::shared_ptr<metadata::MetadataNode>>) override {}

    std::map<Path, std::unique_ptr<metadata::MetadataNode>> getAllFileNodes() override { return {}; }

    std::unique_ptr<metadata::MetadataNode> getFileNode(Path) override { return nullptr; }

    bool hasFileNode(Path) override { return false; }

    void removeFileNodes(std::vector<Path>) override {}

    std::vector<Path> getExtraEntries() override { return {}; }

    std::vector<Path> getChildFiles(Path) override { return {}; }
};

bool isTheAnswer(std::vector<FileLabel> const& labels) {
    return labels.size() == 1 && labels[0].getUUID() == u"m" && labels[0].getFile() == Path(u"/p/e") &&
           labels[0].getData() == u"data";
}

TEST_F(FileManagerDecoratorTest, theProjectRootIsTheInnerOnes) {
    EXPECT_CALL(inner, getProjectRoot()).WillOnce(Return(u"/p"));
    EXPECT_EQ(files.getProjectRoot(), Path(u"/p"));
}

TEST_F(FileManagerDecoratorTest, aStoreForFilesIsTheInnerOnesUndecorated) {
    std::u16string const scope = u"Mine";
    auto made = std::make_unique<SomeFileMetadataManager>();
    auto const* const expected = made.get();
    EXPECT_CALL(inner, getFileMetadataManagerFor(Ref(scope))).WillOnce(Return(ByMove(std::move(made))));
    EXPECT_EQ(files.getFileMetadataManagerFor(scope).get(), expected);
}

TEST_F(FileManagerDecoratorTest, filesAreAddedToTheInnerOne) {
    EXPECT_CALL(inner, add(Ref(given)));
    files.add(given);
}

TEST_F(FileManagerDecoratorTest, whetherAFileIsInTheProjectIsTheInnerOnesAnswer) {
    EXPECT_CALL(inner, isFileInProject(Ref(path))).WillOnce(Return(true)).WillOnce(Return(false));
    EXPECT_TRUE(files.isFileInProject(path));
    EXPECT_FALSE(files.isFileInProject(path));
}

TEST_F(FileManagerDecoratorTest, filesAreRemovedFromTheInnerOneAndItsResultIsReturned) {
    EXPECT_CALL(inner, remove(Ref(given))).WillOnce(Return(answered));
    EXPECT_EQ(files.remove(given), answered);
}

TEST_F(FileManagerDecoratorTest, listsOfFilesAreTheInnerOnes) {
    Paths const all{u"/p/c"};
    EXPECT_CALL(inner, getChildProjectFiles(Ref(path))).WillOnce(Return(answered));
    EXPECT_CALL(inner, getProjectFiles()).WillOnce(Return(all));
    EXPECT_EQ(files.getChildProjectFiles(path), answered);
    EXPECT_EQ(files.getProjectFiles(), all);
}

TEST_F(FileManagerDecoratorTest, labelsArePutOnAndTakenOffByTheInnerOne) {
    EXPECT_CALL(inner, addLabels(Ref(given), Ref(labels))).WillOnce(Return(fileLabels));
    EXPECT_CALL(inner, removeLabels(Ref(given), Ref(labels)));
    EXPECT_TRUE(isTheAnswer(files.addLabels(given, labels)));
    files.removeLabels(given, labels);
}

TEST_F(FileManagerDecoratorTest, labelsAreReadFromTheInnerOne) {
    std::vector<LabelIDSet> const sets{LabelIDSet(u"c", u"l")};
    EXPECT_CALL(inner, getLabelIDSets(Ref(path))).WillOnce(Return(sets));
    EXPECT_CALL(inner, getLabels(Ref(path))).WillOnce(Return(fileLabels));
    EXPECT_EQ(files.getLabelIDSets(path), sets);
    EXPECT_TRUE(isTheAnswer(files.getLabels(path)));
}

TEST_F(FileManagerDecoratorTest, aCategoryIsTakenOffByTheInnerOne) {
    EXPECT_CALL(inner, removeCategory(Ref(given), Ref(category)));
    files.removeCategory(given, category);
}

TEST_F(FileManagerDecoratorTest, anExceptionOfTheInnerOnePropagatesToTheCaller) {
    EXPECT_CALL(inner, add).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, remove).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, getProjectFiles).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(files.add(given), std::out_of_range);
    EXPECT_THROW(files.remove(given), std::out_of_range);
    EXPECT_THROW(static_cast<void>(files.getProjectFiles()), std::out_of_range);
}

} // namespace
} // namespace project::management

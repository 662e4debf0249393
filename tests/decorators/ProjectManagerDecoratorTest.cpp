#include "project/decorators/ProjectManagerDecorator.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "support/ManagerMocks.hpp"

namespace project::management {
namespace {

using testing::Ref;
using testing::Return;
using testing::ReturnRef;
using testing::StrictMock;
using testing::Throw;

class ProjectManagerDecoratorTest : public testing::Test {
protected:
    /// Owned by the decorator.
    StrictMock<test::MockProjectManager>* const inner = new StrictMock<test::MockProjectManager>();
    ProjectManagerDecorator project{std::unique_ptr<ProjectManager>(inner)};
};

TEST_F(ProjectManagerDecoratorTest, theManagersAreThoseOfTheWrappedProject) {
    test::MockEntryPointManager entryPoints;
    test::MockFileManager files;
    test::MockLabelManager labels;
    test::MockProjectReferenceManager references;
    test::MockProjectPathManager path;
    EXPECT_CALL(*inner, getEntryPointManager()).WillOnce(ReturnRef(entryPoints));
    EXPECT_CALL(*inner, getFileManager()).WillOnce(ReturnRef(files));
    EXPECT_CALL(*inner, getLabelManager()).WillOnce(ReturnRef(labels));
    EXPECT_CALL(*inner, getProjectReferenceManager()).WillOnce(ReturnRef(references));
    EXPECT_CALL(*inner, getProjectPathManager()).WillOnce(ReturnRef(path));

    EXPECT_EQ(&project.getEntryPointManager(), &entryPoints);
    EXPECT_EQ(&project.getFileManager(), &files);
    EXPECT_EQ(&project.getLabelManager(), &labels);
    EXPECT_EQ(&project.getProjectReferenceManager(), &references);
    EXPECT_EQ(&project.getProjectPathManager(), &path);
}

TEST_F(ProjectManagerDecoratorTest, theNameIsTheWrappedProjects) {
    std::u16string const name = u"Engine";
    EXPECT_CALL(*inner, setName(Ref(name)));
    EXPECT_CALL(*inner, getName()).WillOnce(Return(u"Motor"));
    project.setName(name);
    EXPECT_EQ(project.getName(), u"Motor");
}

TEST_F(ProjectManagerDecoratorTest, theDescriptionIsTheWrappedProjects) {
    std::u16string const description = u"Two strokes";
    EXPECT_CALL(*inner, setDescription(Ref(description)));
    EXPECT_CALL(*inner, getDescription()).WillOnce(Return(u"Four strokes"));
    project.setDescription(description);
    EXPECT_EQ(project.getDescription(), u"Four strokes");
}

TEST_F(ProjectManagerDecoratorTest, createIsForwarded) {
    std::u16string const name = u"Engine";
    EXPECT_CALL(*inner, create(Ref(name)));
    project.create(name);
}

TEST_F(ProjectManagerDecoratorTest, aListenerIsForwardedUnchanged) {
    std::weak_ptr<metadata::FileChangeRequestListener> passedOn;
    EXPECT_CALL(*inner, subscribe).WillOnce([&](auto listener) { passedOn = listener; });
    auto const owner = std::make_shared<int>();
    std::weak_ptr<metadata::FileChangeRequestListener> const listener(
        std::shared_ptr<metadata::FileChangeRequestListener>(owner, nullptr));
    project.subscribe(listener);
    EXPECT_FALSE(listener.owner_before(passedOn) || passedOn.owner_before(listener));
    EXPECT_EQ(passedOn.use_count(), 1);
}

TEST_F(ProjectManagerDecoratorTest, anExceptionOfTheWrappedProjectPropagatesToTheCaller) {
    EXPECT_CALL(*inner, setName).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(*inner, getName).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(*inner, getFileManager).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(project.setName(u"Engine"), std::out_of_range);
    EXPECT_THROW(static_cast<void>(project.getName()), std::out_of_range);
    EXPECT_THROW(static_cast<void>(project.getFileManager()), std::out_of_range);
}

/// Records its destruction.
class EndingProject : public test::MockProjectManager {
public:
    explicit EndingProject(bool& hasEnded) : hasEnded_(hasEnded) {}

    ~EndingProject() override { hasEnded_ = true; }

private:
    bool& hasEnded_;
};

TEST(ProjectManagerDecorator, theWrappedProjectIsDestroyedWithIt) {
    bool hasEnded = false;
    auto project = std::make_unique<ProjectManagerDecorator>(std::make_unique<EndingProject>(hasEnded));
    EXPECT_FALSE(hasEnded);
    project.reset();
    EXPECT_TRUE(hasEnded);
}

} // namespace
} // namespace project::management

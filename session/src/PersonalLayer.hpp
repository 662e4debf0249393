#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "ChangeExecutor.hpp"
#include "OthersEvents.hpp"
#include "PersonalStore.hpp"
#include "project/decorators/FileManagerDecorator.hpp"
#include "project/decorators/LabelManagerDecorator.hpp"
#include "project/session/Personal.hpp"

namespace project::session {

/// Runs the changes of the personal layer as steps: as part of the step that is open on this thread, or
/// alone.
class PersonalExecutor {
public:
    /// @param project, personal, executor borrowed.
    PersonalExecutor(stores::TreeMetadataManager& project, PersonalStore& personal, ChangeExecutor& executor)
        : project_(project), personal_(personal), executor_(executor) {}

    /// Runs one operation. @throws the exception of the operation, of the commit, or of a slot.
    void execute(std::function<void()> const& operation);

private:
    std::vector<Event> runAlone(std::function<void()> const& operation);

    stores::TreeMetadataManager& project_;
    PersonalStore& personal_;
    ChangeExecutor& executor_;
};

/// The project's files with their personal labels.
class PersonalFileManager : public management::FileManagerDecorator {
public:
    /// @param project the project's file manager; borrowed, as the others are.
    PersonalFileManager(management::FileManager& project, stores::TreeMetadataManager& projectStore,
                        PersonalStore& personal, PersonalExecutor& executor);

    std::vector<management::FileLabel> addLabels(std::vector<Path> const& files,
                                                 std::vector<management::Label> const& labels) override;
    void removeLabels(std::vector<Path> const& files, std::vector<management::Label> const& labels) override;
    std::vector<management::LabelIDSet> getLabelIDSets(Path const& path) override;
    std::vector<management::FileLabel> getLabels(Path const& path) override;
    void removeCategory(std::vector<Path> const& files,
                        management::CategoryIdentifier const& category) override;

private:
    bool canHaveLabels(Path const& file) const;
    void requireLabellable(std::vector<Path> const& files) const;

    management::FileManager& labels() { return personal_.managers().getFileManager(); }

    /// Runs an operation on those of the files that have personal labels.
    void changeLabelled(std::vector<Path> const& files,
                        std::function<void(std::vector<Path> const& labelled)> const& operation);

    stores::TreeMetadataManager& projectStore_;
    PersonalStore& personal_;
    PersonalExecutor& executor_;
};

/// The personal categories and labels.
class PersonalLabelManager : public management::LabelManagerDecorator {
public:
    /// @param personal, executor borrowed.
    PersonalLabelManager(PersonalStore& personal, PersonalExecutor& executor);

    void createCategory(management::CategoryIdentifier const& category) override;
    void deleteCategory(management::CategoryIdentifier const& category) override;
    void renameCategory(management::CategoryIdentifier const& category,
                        std::u16string const& newName) override;
    void createLabel(management::CategoryIdentifier const& category,
                     management::LabelIdentifier const& label) override;
    void deleteLabel(management::CategoryIdentifier const& category,
                     management::LabelIdentifier const& label) override;

private:
    PersonalStore& personal_;
    PersonalExecutor& executor_;
};

class PersonalLayer : public Personal {
public:
    /// @param project the session's own manager; borrowed, as the stores and the executor are.
    PersonalLayer(management::ProjectManager& project,
                  std::shared_ptr<stores::TreeMetadataManager> const& projectStore, PersonalStore& personal,
                  ChangeExecutor& executor);

    management::LabelManager& getLabelManager() noexcept override { return labels_; }

    management::FileManager& getFileManager() noexcept override { return files_; }

    std::shared_ptr<management::DispatchableProjectEventBroadcaster> const& events() const noexcept override {
        return observers_;
    }

    std::vector<Path> hiddenFiles() override;
    std::vector<Path> removeHidden() override;
    std::vector<Move> followHidden(std::vector<Move> const& moves) override;

    /// Dispatches the events of changes by other programs. @return false if there were none.
    bool refresh();

private:
    stores::TreeMetadataManager& projectStore_;
    PersonalStore& personal_;
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers_;
    PersonalExecutor executor_;
    PersonalFileManager files_;
    PersonalLabelManager labels_;
    OthersEvents ofOthers_;
};

} // namespace project::session

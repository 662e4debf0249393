#pragma once

#include <memory>
#include <string>
#include <vector>

#include "ChangeExecutor.hpp"
#include "PersonalStore.hpp"
#include "project/decorators/EntryPointManagerDecorator.hpp"
#include "project/decorators/FileManagerDecorator.hpp"
#include "project/decorators/FolderReferenceManagerDecorator.hpp"
#include "project/decorators/LabelManagerDecorator.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"
#include "project/decorators/ProjectPathManagerDecorator.hpp"
#include "project/decorators/ProjectReferenceManagerDecorator.hpp"

namespace project::session {

// The managers that an application gets from a session. Each hands every change to the ChangeExecutor and
// forwards everything else. What is written through getFileMetadataManagerFor is staged together with the
// next change.
//
// Each borrows its inner manager and the executor, which must outlive it.

class SessionFileManager : public management::FileManagerDecorator {
public:
    /// @param personal loses the labels of the files that are removed.
    SessionFileManager(management::FileManager& inner, ChangeExecutor& executor, PersonalStore& personal)
        : FileManagerDecorator(inner), executor_(executor), personal_(personal) {}

    void add(std::vector<management::Path> const& files) override;
    std::vector<management::Path> remove(std::vector<management::Path> const& files) override;
    std::vector<management::FileLabel> addLabels(std::vector<management::Path> const& files,
                                                 std::vector<management::Label> const& labels) override;
    void removeLabels(std::vector<management::Path> const& files,
                      std::vector<management::Label> const& labels) override;
    void removeCategory(std::vector<management::Path> const& files,
                        management::CategoryIdentifier const& category) override;

private:
    ChangeExecutor& executor_;
    PersonalStore& personal_;
};

class SessionLabelManager : public management::LabelManagerDecorator {
public:
    SessionLabelManager(management::LabelManager& inner, ChangeExecutor& executor)
        : LabelManagerDecorator(inner), executor_(executor) {}

    void createCategory(management::CategoryIdentifier const& category) override;
    void deleteCategory(management::CategoryIdentifier const& category) override;
    void renameCategory(management::CategoryIdentifier const& category,
                        std::u16string const& newName) override;
    void createLabel(management::CategoryIdentifier const& category,
                     management::LabelIdentifier const& label) override;
    void deleteLabel(management::CategoryIdentifier const& category,
                     management::LabelIdentifier const& label) override;

private:
    ChangeExecutor& executor_;
};

class SessionEntryPointManager : public management::EntryPointManagerDecorator {
public:
    SessionEntryPointManager(management::EntryPointManager& inner, ChangeExecutor& executor)
        : EntryPointManagerDecorator(inner), executor_(executor) {}

    void setEntryPoint(management::EntryPoint& entryPoint) override;
    void removeEntryPoint(management::Path file) override;
    void deleteEntryPointGroup(management::EntryPointGroup const& group) override;
    void createEntryPointGroup(management::EntryPointGroup const& group) override;
    void renameEntryPointGroup(management::EntryPointGroup const& group,
                               std::u16string const& newName) override;

private:
    ChangeExecutor& executor_;
};

class SessionFolderReferenceManager : public management::FolderReferenceManagerDecorator {
public:
    SessionFolderReferenceManager(management::FolderReferenceManager& inner, ChangeExecutor& executor)
        : FolderReferenceManagerDecorator(inner), executor_(executor) {}

    void addReferences(std::vector<management::FolderReference> const& references) override;
    void removeReferences(std::vector<management::FolderReference> const& references) override;

private:
    ChangeExecutor& executor_;
};

/// The project with these managers.
class SessionProjectManager : public management::ProjectManagerDecorator {
public:
    /// @param inner the project with all other layers; not null.
    /// @param executor, personal borrowed; must outlive this object.
    SessionProjectManager(std::unique_ptr<management::ProjectManager> inner, ChangeExecutor& executor,
                          PersonalStore& personal);

    management::EntryPointManager& getEntryPointManager() override { return entryPoints_; }

    management::FileManager& getFileManager() override { return files_; }

    management::LabelManager& getLabelManager() override { return labels_; }

    management::ProjectReferenceManager& getProjectReferenceManager() override { return references_; }

    management::ProjectPathManager& getProjectPathManager() override { return projectPath_; }

    void setName(std::u16string const& name) override;
    void setDescription(std::u16string const& description) override;
    void create(std::u16string const& name) override;

private:
    /// The project path or the project references. Deliberately a class with one getter, as its base is.
    template <typename Decorator, typename Manager>
    class WithReferences : public Decorator {
    public:
        WithReferences(Manager& inner, ChangeExecutor& executor)
            : Decorator(inner), references_(inner.getFolderReferenceManager(), executor) {}

        management::FolderReferenceManager& getFolderReferenceManager() override { return references_; }

    private:
        SessionFolderReferenceManager references_;
    };

    ChangeExecutor& executor_;
    SessionFileManager files_;
    SessionLabelManager labels_;
    SessionEntryPointManager entryPoints_;
    WithReferences<management::ProjectPathManagerDecorator, management::ProjectPathManager> projectPath_;
    WithReferences<management::ProjectReferenceManagerDecorator, management::ProjectReferenceManager>
        references_;
};

} // namespace project::session

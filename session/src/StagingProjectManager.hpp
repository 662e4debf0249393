#pragma once

#include <memory>

#include "DefinitionStager.hpp"
#include "StagingEntryPointManager.hpp"
#include "StagingFileManager.hpp"
#include "StagingFolderReferenceManager.hpp"
#include "StagingLabelManager.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"
#include "project/decorators/ProjectPathManagerDecorator.hpp"
#include "project/decorators/ProjectReferenceManagerDecorator.hpp"

namespace project::session {

/// Wraps a project so that its text is staged after each change made through it.
class StagingProjectManager : public management::ProjectManagerDecorator {
public:
    /// @param stager borrowed; must outlive this object.
    StagingProjectManager(std::unique_ptr<management::ProjectManager> inner, DefinitionStager& stager);

    management::EntryPointManager& getEntryPointManager() override;
    management::FileManager& getFileManager() override;
    management::LabelManager& getLabelManager() override;
    management::ProjectReferenceManager& getProjectReferenceManager() override;
    management::ProjectPathManager& getProjectPathManager() override;
    void setName(std::u16string const& name) override;
    void setDescription(std::u16string const& description) override;
    void create(std::u16string const& name) override;

private:
    /// The project path or the project references, with a staging list.
    template <typename Decorator, typename Manager>
    class WithStagingList : public Decorator {
    public:
        WithStagingList(Manager& inner, DefinitionStager& stager)
            : Decorator(inner), list_(inner.getFolderReferenceManager(), stager) {}

        management::FolderReferenceManager& getFolderReferenceManager() override { return list_; }

    private:
        StagingFolderReferenceManager list_;
    };

    DefinitionStager& stager_;
    StagingFileManager files_;
    StagingLabelManager labels_;
    StagingEntryPointManager entryPoints_;
    WithStagingList<management::ProjectPathManagerDecorator, management::ProjectPathManager> projectPath_;
    WithStagingList<management::ProjectReferenceManagerDecorator, management::ProjectReferenceManager>
        references_;
};

} // namespace project::session

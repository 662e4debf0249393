#pragma once

#include <memory>
#include <string>

#include "project/core/ProjectManager.hpp"

namespace project::management {

/// A project that forwards every operation to another one, which it owns. Wrappers derive from this class
/// and override the operations that they change.
///
/// Projects are stacked from the inside out: ProjectManagerBase over the store, then any wrappers, each of
/// which owns the previous one. The application holds the outermost project and calls only that one.
/// Results, errors and locks of every operation are those of the wrapped project.
class PROJECT_MANAGEMENT_EXPORT ProjectManagerDecorator : public ProjectManager {
public:
    /// @param inner the project to wrap; owned by this object; not null.
    explicit ProjectManagerDecorator(std::unique_ptr<ProjectManager> inner);
    ~ProjectManagerDecorator() override;

    EntryPointManager& getEntryPointManager() override;
    FileManager& getFileManager() override;
    LabelManager& getLabelManager() override;
    ProjectReferenceManager& getProjectReferenceManager() override;
    ProjectPathManager& getProjectPathManager() override;
    void setName(std::u16string const& name) override;
    std::u16string getName() const override;
    std::u16string getDescription() const override;
    void setDescription(std::u16string const& description) override;
    void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) override;
    void create(std::u16string const& name) override;

private:
    std::unique_ptr<ProjectManager> inner_;
};

} // namespace project::management

#pragma once

#include <memory>
#include <string>

#include "project/core/ProjectManager.hpp"

namespace project::management {

/// A project that passes everything on to another one, which it owns. What wraps a project derives from this
/// and overrides what it cares about.
///
/// Projects are stacked from the inside out: ProjectManagerBase over the store, then any wrappers, each of
/// which takes over the one before. The application holds the outermost and calls that one alone. Results,
/// errors and locks of every operation are those of the wrapped project.
class PROJECT_MANAGEMENT_EXPORT ProjectManagerDecorator : public ProjectManager {
public:
    /// @param inner the project to wrap, which goes with this object; not null.
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

#pragma once

#include <memory>
#include <string>

#include "project/core/Export.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"

namespace project::management {

class EntryPointManager;
class FileManager;
class LabelManager;
class ProjectPathManager;
class ProjectReferenceManager;

/// One open project: its name and description, and the managers of all else.
///
/// The managers belong to the project and live as long as it. The accessors take no lock.
class PROJECT_MANAGEMENT_EXPORT ProjectManager {
public:
    virtual ~ProjectManager();

    virtual EntryPointManager& getEntryPointManager() = 0;
    virtual FileManager& getFileManager() = 0;
    virtual LabelManager& getLabelManager() = 0;
    virtual ProjectReferenceManager& getProjectReferenceManager() = 0;
    virtual ProjectPathManager& getProjectPathManager() = 0;

    /// Takes the write lock. Any text is accepted; an empty one reads like none.
    virtual void setName(std::u16string const& name) = 0;

    /// The project's name; empty when it has none. Takes the read lock.
    virtual std::u16string getName() const = 0;

    /// The project's description; empty when it has none. Takes the read lock.
    virtual std::u16string getDescription() const = 0;

    /// Takes the write lock. Any text is accepted; an empty one reads like none.
    virtual void setDescription(std::u16string const& description) = 0;

    /// Has the store tell a listener of the files that its writes bring or take away, for as long as the
    /// listener lives. Takes no lock.
    virtual void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) = 0;

    /// Makes a project: gives it its name, by setName.
    virtual void create(std::u16string const& name) = 0;
};

} // namespace project::management

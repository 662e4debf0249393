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

/// An open project: its name, its description, and the managers of the rest of its definition.
///
/// The project owns its managers; references to them are valid as long as the project. The accessors take no
/// lock.
class PROJECT_MANAGEMENT_EXPORT ProjectManager {
public:
    virtual ~ProjectManager();

    /// The files that users start from.
    virtual EntryPointManager& getEntryPointManager() = 0;
    /// The files and folders of the project, and the labels on them.
    virtual FileManager& getFileManager() = 0;
    /// The categories and labels that files can have.
    virtual LabelManager& getLabelManager() = 0;
    /// The references to other projects.
    virtual ProjectReferenceManager& getProjectReferenceManager() = 0;
    /// The folders on the project path.
    virtual ProjectPathManager& getProjectPathManager() = 0;

    /// Stores the project's name. An empty name reads like no name. Takes the write lock.
    virtual void setName(std::u16string const& name) = 0;

    /// Returns the project's name; empty if it has none. Takes the read lock.
    virtual std::u16string getName() const = 0;

    /// Returns the project's description; empty if it has none. Takes the read lock.
    virtual std::u16string getDescription() const = 0;

    /// Stores the project's description. An empty description reads like no description. Takes the write
    /// lock.
    virtual void setDescription(std::u16string const& description) = 0;

    /// Subscribes a listener to the files on disk that the store's writes create or delete, as long as the
    /// listener lives. Takes no lock.
    virtual void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) = 0;

    /// Creates a project by storing its name with setName. Takes the write lock.
    virtual void create(std::u16string const& name) = 0;
};

} // namespace project::management

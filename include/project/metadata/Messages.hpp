#pragma once

#include <concepts>
#include <string>

#include "project/metadata/Export.hpp"
#include "resource_core/BaseMsgID.hpp"

/// The messages of the library, one class for each, in the catalog `ZEPHRA:project:management`.
///
/// The name of a class is the key of its text in src/metadata/messages, spelling included. Its constructor
/// takes the text's arguments in order, as UTF-16 text. The outer namespace project is written with
/// leading colons throughout, because project alone would mean this namespace.
namespace ZEPHRA::project::management {

/// The type of a message's argument: std::u16string, or anything that converts to it, such as a literal.
template <class T>
concept MessageText = std::convertible_to<T const&, std::u16string>;

/// Returns the catalog's name. The first call registers the texts with fl::i18n::MessageCatalog, so that
/// every message object has a text.
PROJECT_METADATA_EXPORT std::string const& projectCatalog();

/// Returns the message whose text is the name of the default entry point group. It is not an error.
PROJECT_METADATA_EXPORT ::resource_core::BaseMsgID entryPointGroupDefaultName();

/// The file or folder is not in the project.
class PROJECT_METADATA_EXPORT FileNotInProject : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit FileNotInProject(Text const& path) : BaseMsgID(projectCatalog(), "FileNotInProject", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// The path is inside the folder that contains the store's own files.
class PROJECT_METADATA_EXPORT FileIsMetadataError : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit FileIsMetadataError(Text const& path) : BaseMsgID(projectCatalog(), "FileIsMetadataError", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// The path is outside the project's root.
class PROJECT_METADATA_EXPORT FileNotInProjectRoot : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Path, MessageText ProjectRoot>
    FileNotInProjectRoot(Path const& path, ProjectRoot const& projectRoot)
        : BaseMsgID(projectCatalog(), "FileNotInProjectRoot", 2) {
        setArgument(0, std::u16string(path));
        setArgument(1, std::u16string(projectRoot));
    }
};

/// The path is below the project's root, but does not exist on disk.
class PROJECT_METADATA_EXPORT FileDoesNotExistError : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit FileDoesNotExistError(Text const& path)
        : BaseMsgID(projectCatalog(), "FileDoesNotExistError", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// A folder cannot have a rule that keeps it up to date: it is not a folder on disk within the project, or
/// belongs to the store or to source control.
class PROJECT_METADATA_EXPORT SyncFolderUnsuitable : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit SyncFolderUnsuitable(Text const& path) : BaseMsgID(projectCatalog(), "SyncFolderUnsuitable", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// The folder of a rule is missing or empty, so that its rule would remove everything that the project lists
/// below it.
class PROJECT_METADATA_EXPORT SyncFolderMissing : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit SyncFolderMissing(Text const& path) : BaseMsgID(projectCatalog(), "SyncFolderMissing", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// The project's root cannot be removed from its own project.
class PROJECT_METADATA_EXPORT RootFolderNotRemoveable : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit RootFolderNotRemoveable(Text const& path)
        : BaseMsgID(projectCatalog(), "RootFolderNotRemoveable", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// An entry point group with this UUID exists already.
class PROJECT_METADATA_EXPORT EntryPointGroupUUIDDefined : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit EntryPointGroupUUIDDefined(Text const& uuid)
        : BaseMsgID(projectCatalog(), "EntryPointGroupUUIDDefined", 1) {
        setArgument(0, std::u16string(uuid));
    }
};

/// An entry point group with this name exists already.
class PROJECT_METADATA_EXPORT EntryPointGroupNameDefined : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit EntryPointGroupNameDefined(Text const& name)
        : BaseMsgID(projectCatalog(), "EntryPointGroupNameDefined", 1) {
        setArgument(0, std::u16string(name));
    }
};

/// The name is not that of an entry point type. The exception is always nested over std::out_of_range.
class PROJECT_METADATA_EXPORT EntryPointTypeUndefined : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit EntryPointTypeUndefined(Text const& typeName)
        : BaseMsgID(projectCatalog(), "EntryPointTypeUndefined", 1) {
        setArgument(0, std::u16string(typeName));
    }
};

/// The category is read-only.
class PROJECT_METADATA_EXPORT CanNotModifyReadOnlyCategory : public ::resource_core::BaseMsgID {
public:
    CanNotModifyReadOnlyCategory() : BaseMsgID(projectCatalog(), "CanNotModifyReadOnlyCategory", 0) {}
};

/// The label is read-only.
class PROJECT_METADATA_EXPORT CanNotModifyReadOnlyLabel : public ::resource_core::BaseMsgID {
public:
    CanNotModifyReadOnlyLabel() : BaseMsgID(projectCatalog(), "CanNotModifyReadOnlyLabel", 0) {}
};

/// The category does not exist.
class PROJECT_METADATA_EXPORT CategoryDoesNotExist : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit CategoryDoesNotExist(Text const& categoryName)
        : BaseMsgID(projectCatalog(), "CategoryDoesNotExist", 1) {
        setArgument(0, std::u16string(categoryName));
    }
};

/// A category with this UUID does not exist.
class PROJECT_METADATA_EXPORT CategoryDoesNotExistsByUUID : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit CategoryDoesNotExistsByUUID(Text const& uuid)
        : BaseMsgID(projectCatalog(), "CategoryDoesNotExistsByUUID", 1) {
        setArgument(0, std::u16string(uuid));
    }
};

/// A category with this name exists already.
class PROJECT_METADATA_EXPORT CategoryExistsByName : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit CategoryExistsByName(Text const& categoryName)
        : BaseMsgID(projectCatalog(), "CategoryExistsByName", 1) {
        setArgument(0, std::u16string(categoryName));
    }
};

/// The category has a label with this name already.
class PROJECT_METADATA_EXPORT LabelExistsByName : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText CategoryName, MessageText LabelName>
    LabelExistsByName(CategoryName const& categoryName, LabelName const& labelName)
        : BaseMsgID(projectCatalog(), "LabelExistsByName", 2) {
        setArgument(0, std::u16string(categoryName));
        setArgument(1, std::u16string(labelName));
    }
};

/// A label with this UUID does not exist.
class PROJECT_METADATA_EXPORT LabelDoesNotExistsByUUID : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit LabelDoesNotExistsByUUID(Text const& uuid)
        : BaseMsgID(projectCatalog(), "LabelDoesNotExistsByUUID", 1) {
        setArgument(0, std::u16string(uuid));
    }
};

/// The name is not that of a label state. The exception is always nested over std::out_of_range.
class PROJECT_METADATA_EXPORT LabelReadOnlyStateUndefined : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit LabelReadOnlyStateUndefined(Text const& stateName)
        : BaseMsgID(projectCatalog(), "LabelReadOnlyStateUndefined", 1) {
        setArgument(0, std::u16string(stateName));
    }
};

/// The folder is on the project path already.
class PROJECT_METADATA_EXPORT DuplicatePathEntryException : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit DuplicatePathEntryException(Text const& path)
        : BaseMsgID(projectCatalog(), "DuplicatePathEntryException", 1) {
        setArgument(0, std::u16string(path));
    }
};

/// The folder is referenced as a project already.
class PROJECT_METADATA_EXPORT DuplicateReferenceException : public ::resource_core::BaseMsgID {
public:
    /// The message with its arguments.
    template <MessageText Text>
    explicit DuplicateReferenceException(Text const& path)
        : BaseMsgID(projectCatalog(), "DuplicateReferenceException", 1) {
        setArgument(0, std::u16string(path));
    }
};

} // namespace ZEPHRA::project::management

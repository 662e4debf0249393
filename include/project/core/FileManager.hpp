#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/Export.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

class CategoryIdentifier;
class FileLabel;
class FileMetadataManager;
class Label;
class LabelIDSet;

/// The files and folders that belong to a project, and the labels on them.
///
/// Paths are absolute and in the form of the project's root. Returned lists of paths are in Path order, in
/// which a folder precedes its contents. The root itself is always in the project and never in a list.
class PROJECT_MANAGEMENT_EXPORT FileManager {
public:
    virtual ~FileManager();

    /// Returns the project's root folder, absolute. Takes no lock.
    virtual Path getProjectRoot() = 0;

    /// Returns a manager that stores one node for each file, in which an application keeps data of its own.
    /// Each scope is separate; the scope "Root" is the file list itself. The caller owns the result. Nothing
    /// is written until it is used. Takes no lock.
    virtual std::unique_ptr<FileMetadataManager> getFileMetadataManagerFor(std::u16string const& scope) = 0;

    /// Adds files and folders, and all folders between them and the root, in one batch. The contents of a
    /// folder are not added. A file that is already in the project is stored again without its labels, and so
    /// are the folders above it: this is deliberate, a file that was just added has no labels. Takes the
    /// write lock.
    /// @throws FileIsMetadataError, FileNotInProjectRoot or FileDoesNotExistError for the first path in Path
    ///         order that cannot be added. Nothing is added then.
    virtual void add(std::vector<Path> const& files) = 0;

    /// Returns true for the root and for each file and folder that was added. Does not access the disk. Takes
    /// the read lock.
    virtual bool isFileInProject(Path const& path) const = 0;

    /// Removes files and folders with everything below them, their entry points, and their nodes in every
    /// scope. Does not access the disk. Takes the write lock.
    /// @return the removed files and folders.
    /// @throws FileNotInProject or RootFolderNotRemoveable for the first path in Path order that cannot be
    ///         removed.
    /// @throws EntryPointTypeUndefined if an entry point of any file in the project has an unknown type.
    ///         After each of these errors nothing is removed.
    virtual std::vector<Path> remove(std::vector<Path> const& files) = 0;

    /// Returns the files and folders of the project directly below a folder, by name in code units. The list
    /// is empty for any other path. Takes the read lock.
    virtual std::vector<Path> getChildProjectFiles(Path const& path) const = 0;

    /// Returns all files and folders of the project except the root. Takes the read lock for each folder and
    /// not for the whole operation: a concurrent write may appear in the result in part.
    virtual std::vector<Path> getProjectFiles() const = 0;

    /// Puts every label on every file, in one batch. Files that are not in the project are skipped. A
    /// label that a file already has is deliberately put on it once more: in a single-valued category it
    /// replaces itself and is returned, in any other category the file has it twice. Takes the write lock.
    /// @return the labels of single-valued categories that the new ones replaced, with their data.
    /// @throws FileNotInProject for the root, which has no node. Nothing is written then.
    virtual std::vector<FileLabel> addLabels(std::vector<Path> const& files,
                                             std::vector<Label> const& labels) = 0;

    /// Removes every label and its data from every file. Labels that a file does not have are skipped. Takes
    /// the write lock.
    /// @throws FileNotInProject if a file is not in the project. Nothing is written then.
    virtual void removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) = 0;

    /// Returns the labels of a file by UUID alone, grouped by category. The categories are in the order of
    /// the file's node, which is the order in which the file got its first label of each; the labels of a
    /// category are in the order in which the file got them. Takes the read lock.
    /// @throws FileNotInProject if the file is not in the project.
    virtual std::vector<LabelIDSet> getLabelIDSets(Path const& path) = 0;

    /// Returns the labels of a file, in the order of getLabelIDSets. A label that has data is deliberately
    /// listed twice, first with the data and then without it: every label has an entry without data, by which
    /// callers count labels, and callers that need the data use the first entry. Takes the read lock.
    /// @throws FileNotInProject if the file is not in the project.
    /// @throws CategoryDoesNotExistsByUUID, CategoryDoesNotExist or LabelDoesNotExistsByUUID if the
    ///         definition of a label or of its category was removed.
    /// @throws LabelReadOnlyStateUndefined if the stored state of a label is unknown.
    virtual std::vector<FileLabel> getLabels(Path const& path) = 0;

    /// Removes all labels of a category from the files, in one batch. The labels' data stays stored. Takes
    /// the write lock.
    /// @throws FileNotInProject if a file is not in the project. Nothing is written then.
    virtual void removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) = 0;
};

} // namespace project::management

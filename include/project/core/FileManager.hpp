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
/// Paths are absolute and in the same form as the project root. Lists of paths that come back are in Path
/// order unless told otherwise. The project root itself is always in the project and never in a list.
class PROJECT_MANAGEMENT_EXPORT FileManager {
public:
    virtual ~FileManager();

    /// The project's root folder. Takes no lock.
    virtual Path getProjectRoot() = 0;

    /// A store of one node for each project file, for whoever has data of its own to keep by file. The scope
    /// keeps it apart from others; "Root" is the file list itself. The caller owns the result; nothing is
    /// written until it is used. Takes no lock.
    virtual std::unique_ptr<FileMetadataManager> getFileMetadataManagerFor(std::u16string const& scope) = 0;

    /// Adds files and folders together with all the folders between them and the root, in one batch. The
    /// contents of a folder are not added. What is already in the project is written anew and loses its
    /// labels, as do the folders above it. Takes the write lock.
    /// @throws FileIsMetadataError, FileNotInProjectRoot, FileDoesNotExistError for the first path, in Path
    ///         order, that cannot be added; nothing is added then.
    virtual void add(std::vector<Path> const& files) = 0;

    /// True for the root and for what was added. The disk is not asked. Takes the read lock.
    virtual bool isFileInProject(Path const& path) const = 0;

    /// Removes files and folders with everything below them, their entry points, and what stands on them in
    /// any scope. The disk is left alone and not asked. Takes the write lock.
    /// @return all that went, a folder before its contents.
    /// @throws FileNotInProject, RootFolderNotRemoveable before anything is removed.
    virtual std::vector<Path> remove(std::vector<Path> const& files) = 0;

    /// What is in the project directly below a folder, in the store's order; empty for anything else. Takes
    /// the read lock.
    virtual std::vector<Path> getChildProjectFiles(Path const& path) const = 0;

    /// All files and folders of the project but the root. Holds no lock across its walk: what others write
    /// meanwhile may be in it or not.
    virtual std::vector<Path> getProjectFiles() const = 0;

    /// Puts every label on every file, in one batch. Files that are not in the project are passed over.
    /// Takes the write lock.
    /// @return the labels that had to go from a single-valued category, with their data.
    /// @throws FileNotInProject for the root, which has no node to bear a label.
    virtual std::vector<FileLabel> addLabels(std::vector<Path> const& files,
                                             std::vector<Label> const& labels) = 0;

    /// Takes every label off every file, with its data; labels that a file does not bear are passed over.
    /// Takes the write lock.
    /// @throws FileNotInProject before anything is written.
    virtual void removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) = 0;

    /// The labels of a file by UUID alone, in the order in which they were put on. Takes the read lock.
    /// @throws FileNotInProject
    virtual std::vector<LabelIDSet> getLabelIDSets(Path const& path) = 0;

    /// The labels of a file. One that has data is there twice, first with the data and right after without:
    /// who needs the data takes the first. Takes the read lock.
    /// @throws FileNotInProject, CategoryDoesNotExistsByUUID, CategoryDoesNotExist, LabelDoesNotExistsByUUID
    virtual std::vector<FileLabel> getLabels(Path const& path) = 0;

    /// Takes all labels of a category off the files, in one batch. Takes the write lock.
    /// @throws FileNotInProject before anything is written.
    virtual void removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) = 0;
};

} // namespace project::management

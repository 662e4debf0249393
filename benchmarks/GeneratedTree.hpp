#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::benchmarks {

/// A tree of folders with empty files, in a temporary folder. The destructor deletes it.
class GeneratedTree {
public:
    enum class Shape {
        Wide, ///< folders of twenty files, fifty of them in a folder
        Flat, ///< all files in one folder
        Deep, ///< a hundred folders inside each other, with as many files in each
        Real, ///< the names below /usr, in copies of it if there are not enough of them
    };

    explicit GeneratedTree(std::size_t files, Shape shape = Shape::Wide);
    ~GeneratedTree();
    GeneratedTree(GeneratedTree const&) = delete;
    GeneratedTree& operator=(GeneratedTree const&) = delete;

    /// The tree of 100,000 files in 5,000 folders that most measurements share.
    static GeneratedTree const& large();

    std::filesystem::path const& onDisk() const { return root_; }

    fl::filesystem::Path const& root() const { return rootPath_; }

    /// The absolute paths of the files. Adding a file to a project also adds its folders.
    std::vector<fl::filesystem::Path> const& files() const { return files_; }

    /// Creates one more file in the folder of the first one.
    fl::filesystem::Path createFile(std::string const& name) const;

    /// Opens the text store of the tree, like a new process.
    std::shared_ptr<stores::TreeMetadataManager> openStore() const;

    /// Opens the project of the tree with the text store, like a new process.
    std::unique_ptr<management::ProjectManager> openProject() const;

    /// The definition, whose time stamps each guard checks.
    std::filesystem::path text() const;

    /// Deletes the project's definition.
    void removeProject() const;

    /// Adds all files to the project, if they are not in it yet.
    void fillProject() const;

    /// Creates a git repository with all files in its index, if there is none yet.
    void fillRepository() const;

private:
    std::filesystem::path root_;
    fl::filesystem::Path rootPath_;
    std::vector<fl::filesystem::Path> files_;
};

} // namespace project::benchmarks

#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/ProjectManagerBase.hpp"

namespace project::benchmarks {

/// A tree of folders with twenty empty files each, in a temporary folder. The destructor deletes it.
class GeneratedTree {
public:
    explicit GeneratedTree(std::size_t files);
    ~GeneratedTree();
    GeneratedTree(GeneratedTree const&) = delete;
    GeneratedTree& operator=(GeneratedTree const&) = delete;

    /// The tree of 100,000 files in 5,000 folders that most measurements share.
    static GeneratedTree const& large();

    std::filesystem::path const& onDisk() const { return root_; }

    fl::filesystem::Path const& root() const { return rootPath_; }

    /// The absolute paths of the files. Adding a file to a project also adds its folders.
    std::vector<fl::filesystem::Path> const& files() const { return files_; }

    /// Creates one more file in the first folder.
    fl::filesystem::Path createFile(std::string const& name) const;

    /// Opens the project of the tree with the text store, like a new process.
    std::unique_ptr<management::ProjectManager> openProject() const;

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

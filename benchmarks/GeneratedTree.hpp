#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/ProjectManagerBase.hpp"

namespace project::benchmarks {

/// A tree of folders with twenty empty files each, on disk in a temporary folder; gone with the object.
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

    /// The files, absolute; the folders come with them.
    std::vector<fl::filesystem::Path> const& files() const { return files_; }

    /// Makes one more file in the first folder.
    fl::filesystem::Path makeFile(std::string const& name) const;

    /// A project on the tree with the text store, as a new process would open it.
    std::unique_ptr<management::ProjectManager> openProject() const;

    /// Removes the project's definition.
    void removeProject() const;

    /// Sees to it that all files are in the project.
    void fillProject() const;

    /// Sees to it that the tree is a git repository with all files in its index.
    void fillRepository() const;

private:
    std::filesystem::path root_;
    fl::filesystem::Path rootPath_;
    std::vector<fl::filesystem::Path> files_;
};

} // namespace project::benchmarks

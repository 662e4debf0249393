#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>

#include "fl/filesystem/Path.hpp"

namespace project::test {

/// A new empty folder on disk. The destructor deletes it with its contents.
class TemporaryFolder {
public:
    TemporaryFolder() {
        auto pattern = (std::filesystem::temp_directory_path() / "project-test-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error("no temporary folder could be created at " + pattern);
        }
        folder_ = std::filesystem::canonical(pattern);
    }

    ~TemporaryFolder() {
        std::error_code ignored;
        std::filesystem::remove_all(folder_, ignored);
    }

    TemporaryFolder(TemporaryFolder const&) = delete;
    TemporaryFolder& operator=(TemporaryFolder const&) = delete;

    /// The folder's name on disk, canonical.
    std::filesystem::path const& onDisk() const { return folder_; }

    /// The folder as a path of the library.
    fl::filesystem::Path root() const { return fl::filesystem::fromSystem(folder_); }

    /// A path below the folder, which may not exist.
    fl::filesystem::Path path(std::u16string const& relative) const { return root() / relative; }

    /// Creates a file, and the missing folders above it.
    fl::filesystem::Path file(std::u16string const& relative, std::string const& content = "content") const {
        auto const made = path(relative);
        auto const onDisk = fl::filesystem::toSystem(made);
        std::filesystem::create_directories(onDisk.parent_path());
        std::ofstream(onDisk) << content;
        return made;
    }

    /// Creates a folder, and the missing folders above it.
    fl::filesystem::Path folder(std::u16string const& relative) const {
        auto const made = path(relative);
        std::filesystem::create_directories(fl::filesystem::toSystem(made));
        return made;
    }

    /// The folder as a path of the library.
    fl::filesystem::Path path() const { return root(); }

    /// The same for a name on disk, which may not be UTF-8. @return the path on disk.
    std::filesystem::path addFile(std::filesystem::path const& relative,
                                  std::string const& content = {}) const {
        auto const made = folder_ / relative;
        std::filesystem::create_directories(made.parent_path());
        std::ofstream(made, std::ios::binary) << content;
        return made;
    }

    std::filesystem::path addFolder(std::filesystem::path const& relative) const {
        std::filesystem::create_directories(folder_ / relative);
        return folder_ / relative;
    }

    std::filesystem::path addLink(std::filesystem::path const& relative,
                                  std::filesystem::path const& target) const {
        std::filesystem::create_symlink(target, folder_ / relative);
        return folder_ / relative;
    }

    /// Deletes a file, or a folder with its contents.
    void remove(std::u16string const& relative) const {
        std::filesystem::remove_all(fl::filesystem::toSystem(path(relative)));
    }

private:
    std::filesystem::path folder_;
};

} // namespace project::test

#pragma once

#include <optional>
#include <string>

#include "disk/ForkSafeDescriptor.hpp"
#include "project/stores/Disk.hpp"

namespace project::stores {

/// The store's folder on the file system: its path, and the folder that was opened there.
///
/// The path may later lead to another folder while this one stays open. Operations on the open folder then
/// affect the old one, and isInPlace returns false.
class SystemFolder {
public:
    /// @param root the project's root folder, absolute.
    SystemFolder(std::string root, std::string const& name);

    std::string const& path() const noexcept { return path_; }

    std::string pathOf(std::string const& name) const { return path_ + "/" + name; }

    bool isOpen() const noexcept { return folder_.isOpen(); }

    /// The descriptor of the open folder. Throws StoreError if it is not open.
    int get() const;

    /// See Disk for these.
    bool open();
    bool make();
    void remove() noexcept;
    bool isInPlace() const;

    /// @throws StoreError in the child process after a fork, where the parent's files are closed.
    void requireOwnProcess() const;

private:
    void openRoot(ForkSafeDescriptor& root, int flags) const;
    bool openIn(int root);

    std::string const root_;
    std::string const name_;
    std::string const path_;
    ForkSafeDescriptor folder_;
    FileIdentity identity_;
};

} // namespace project::stores

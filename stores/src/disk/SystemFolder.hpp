#pragma once

#include <optional>
#include <string>

#include "disk/ForkSafeDescriptor.hpp"
#include "project/stores/Disk.hpp"

namespace project::stores {

/// The store's folder on the file system: its path, and the folder that was open when one last looked.
///
/// The path can come to lead to another folder while this one stays open. What is done through the open
/// folder then happens in the old one, and isInPlace tells of it.
class SystemFolder {
public:
    /// @param root the project's root folder, absolute.
    SystemFolder(std::string root, std::string const& name);

    std::string const& path() const noexcept { return path_; }

    std::string pathOf(std::string const& name) const { return path_ + "/" + name; }

    bool isOpen() const noexcept { return folder_.isOpen(); }

    /// The open folder, for a call relative to it. Throws StoreError when it is not open.
    int get() const;

    /// See Disk for these.
    bool open();
    bool make();
    void remove() noexcept;
    bool isInPlace() const;

    /// Fails in the child of a fork, where nothing of the parent's is open.
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

#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>

#include "project/session/FileLevel.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The project's file list, read directly from the store: the files that the file manager lists, with their
/// kinds, in a tenth of the time. The caller holds a guard of the store, so that all results show one state.
class FileTree {
public:
    /// @param store, root borrowed.
    FileTree(stores::TreeMetadataManager& store, Path const& root) : store_(store), root_(root) {}

    /// The address of an entry below an address.
    static metadata::MetadataPath below(metadata::MetadataPath const& address, std::u16string_view name);

    /// The address of a file. @param path absolute, the root or below it.
    metadata::MetadataPath addressOf(Path const& path) const;

    /// The level of an address; empty if the address does not exist.
    FileLevel level(metadata::MetadataPath const& address) const;

    /// Visits a path, unless it is the root, and everything in the project below it: a folder before its
    /// contents, and the contents by name.
    /// @param path absolute. Nothing is visited if it is not in the project.
    void visit(Path const& path, FileVisitor const& visitor) const;

private:
    struct Open;

    void visitBelow(metadata::MetadataPath start, FileLevel level, std::u16string path, std::size_t depth,
                    FileVisitor const& visitor) const;

    stores::TreeMetadataManager& store_;
    Path const& root_;
};

} // namespace project::session

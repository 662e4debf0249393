#pragma once

#include <string_view>

#include "project/OpenProject.hpp"

namespace projectctl {

/// The project's file list, read directly from the store: the files that the file manager lists, with their
/// kinds, in a tenth of the time. An entry is a folder if it was one when it was added.
///
/// Holds the store's read guard, so that all results show one state of the project.
class FileList {
public:
    using Address = project::metadata::MetadataPath;
    using Level = project::session::FileLevel;
    using Entry = Level::Entry;
    using File = project::session::VisitedFile;
    using Visitor = project::session::FileVisitor;

    explicit FileList(OpenProject& project);

    /// The address of an entry below an address.
    static Address below(Address const& address, std::u16string_view name);

    /// The address of a file. @param path absolute, the project's root or below it.
    Address addressOf(Path const& path) const { return access_.addressOf(path); }

    /// The level of an address; empty when the address does not exist.
    Level level(Address const& address) const { return access_.level(address); }

    /// Visits the files that a query finds, in the order of the store.
    void visit(project::session::Query const& query, Visitor const& visitor) const {
        access_.visit(query, visitor);
    }

    /// Visits a path, unless it is the root, and everything in the project below it: a folder before its
    /// contents, and the contents by name.
    /// @param path absolute, in the project.
    void visit(Path const& path, Visitor const& visitor) const;

private:
    project::session::ToolAccess& access_;
    cmlink::ReentrantReadWriteLock::LockGuard guard_;
};

} // namespace projectctl

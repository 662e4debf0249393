#pragma once

#include <functional>
#include <string>

#include "output/Kind.hpp"
#include "project/OpenProject.hpp"
#include "project/stores/Backend.hpp"

namespace projectctl {

/// The project's file list, read straight from the store: the same files as the file manager lists, and of
/// each whether it is a folder, for a tenth of the time. A folder is what was one when it was added.
///
/// Holds the store's read guard, so that all of it is one state of the project.
class FileList {
public:
    explicit FileList(OpenProject& project);

    /// What the store has at one address of the list.
    struct Level {
        Kind kind = Kind::File;          ///< of what the address leads to
        project::stores::Children files; ///< directly below it, by name in code units
    };

    /// The address of a file. @param path absolute, the project's root or below it.
    project::metadata::MetadataPath addressOf(Path const& path) const;

    /// Empty for an address that does not exist. A file below it without a node is not in the project, nor is
    /// what lies below that.
    Level level(project::metadata::MetadataPath const& address) const;

    /// A file or folder of the project.
    struct File {
        std::u16string const& path; ///< relative to the root
        std::size_t depth;          ///< how many folders lie between it and where the walk began
        Kind kind;
        project::metadata::MetadataNode const& node; ///< what stands on it
    };

    using Visitor = std::function<void(File const& file)>;

    /// Visits everything in the project below a path, a folder before its contents, in the order of their
    /// names; the path itself too, unless it is the root.
    /// @param path absolute, in the project.
    void visit(Path const& path, Visitor const& visitor) const;

private:
    struct Open;

    void visitBelow(project::metadata::MetadataPath start, Level level, std::u16string path,
                    std::size_t depth, Visitor const& visitor) const;

    OpenProject& project_;
    cmlink::ReentrantReadWriteLock::LockGuard guard_;
};

} // namespace projectctl

#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "output/Kind.hpp"
#include "project/OpenProject.hpp"
#include "project/stores/Backend.hpp"

namespace projectctl {

/// The project's file list, read directly from the store: the files that the file manager lists, with their
/// kinds, in a tenth of the time. An entry is a folder if it was one when it was added.
///
/// Holds the store's read guard, so that all results show one state of the project.
class FileList {
public:
    explicit FileList(OpenProject& project);

    /// An entry directly below an address.
    struct Entry {
        std::size_t nameBegin; ///< in the names of its level
        std::size_t nameLength;
        project::stores::Node node; ///< null if the entry is not in the project
        bool hasChildren;
    };

    /// The content of one address of the list.
    struct Level {
        Kind kind = Kind::File; ///< of the entry at the address
        std::u16string names;
        std::vector<Entry> files; ///< the entries directly below it, by name in code units

        std::u16string_view nameOf(Entry const& file) const {
            return std::u16string_view(names).substr(file.nameBegin, file.nameLength);
        }
    };

    /// The address of an entry below an address.
    static project::metadata::MetadataPath below(project::metadata::MetadataPath const& address,
                                                 std::u16string_view name);

    /// The address of a file. @param path absolute, the project's root or below it.
    project::metadata::MetadataPath addressOf(Path const& path) const;

    /// The level of an address; empty when the address does not exist. An entry in it without a node is not
    /// in the project, nor is anything below that entry.
    Level level(project::metadata::MetadataPath const& address) const;

    /// A file or folder of the project.
    struct File {
        std::u16string const& path; ///< relative to the root
        std::size_t depth;          ///< number of folders between it and the start of the visit
        Kind kind;
        project::metadata::MetadataNode const& node; ///< the value stored for it
    };

    using Visitor = std::function<void(File const& file)>;

    /// Visits a path, unless it is the root, and everything in the project below it: a folder before its
    /// contents, and the contents by name.
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

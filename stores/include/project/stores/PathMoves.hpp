#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>

#include "project/stores/Export.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

/// Files and folders that move to other paths, all at the same time: two files can exchange their places, and
/// a file can move to a place that another one leaves. Says where each part of a definition that refers to
/// one of them belongs afterwards: addresses of files in every scope, entry points, the project path, and
/// references. docs/tree.md lists these places.
///
/// Paths are relative to the project's root, with `/` between names.
class PROJECT_STORES_EXPORT PathMoves {
public:
    /// Adds a move, in place of an earlier one from the same path. A move to the same path keeps a file where
    /// it is, whatever moves above it.
    /// @param isTree whether everything below that has no move of its own moves too; the nearest folder above
    ///        decides.
    void add(std::u16string from, std::u16string to, bool isTree = false);

    /// Removes the move from a path, if there is one.
    void remove(std::u16string_view from);

    /// Returns true if it contains no move.
    bool empty() const noexcept { return entries_.empty(); }

    /// The new path of a file or folder; nothing if it does not move.
    std::optional<std::u16string> moved(std::u16string_view path) const;

    /// The new address of anything at or below the address of a file or folder, in any scope; nothing if it
    /// does not move.
    std::optional<Address> moved(Address const& address) const;

    /// A node with the new paths in its keys: of an entry point, or of a relative reference in the project
    /// path or in the list of references. Every other node is returned as it is.
    /// @param address of the node.
    /// @param root the absolute path of the project's root: absolute references to places below it are
    ///        changed, too. Empty if it is not known.
    Node moved(Address const& address, Node const& node, std::u16string_view root = {}) const;

    /// The moves in the other direction.
    PathMoves reversed() const;

    /// The new path of a file or folder.
    struct Target {
        std::u16string path; ///< relative to the root
        bool isTree;         ///< whether everything below it moves as well
    };

    /// The new paths by the old ones.
    using Entries = std::map<std::u16string, Target, std::less<>>;

    /// The moves by the earlier path.
    Entries const& entries() const noexcept { return entries_; }

private:
    Entries entries_;
};

} // namespace project::stores

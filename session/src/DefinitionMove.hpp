#pragma once

#include <map>
#include <memory>
#include <vector>

#include "project/session/Move.hpp"
#include "project/stores/PathMoves.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Rewrites a definition for files and folders that have moved: their nodes in every scope with everything
/// below them, entry points, the project path and references. Adds the folders above the new paths.
///
/// Call it in a transaction, which is rolled back if anything throws.
class DefinitionMove {
public:
    /// The folders that have nothing below them any more, and for which nothing else is stored.
    enum class EmptiedFolders {
        Stay,  ///< in the project: they are still on disk
        Leave, ///< the project, as they leave git with their last file
    };

    /// @param root of the project. Both borrowed.
    DefinitionMove(stores::TreeMetadataManager& store, Path const& root) : store_(store), root_(root) {}

    /// @param moves at the same time.
    /// @throws MoveError with the reason IsInProject if a new path is in the project and is not left by
    ///         another move.
    void run(std::vector<Move> const& moves, EmptiedFolders emptied);

    /// The moves, with paths relative to the root.
    stores::PathMoves const& moves() const noexcept { return moves_; }

    /// The changes, sorted.
    stores::Changes takeChanges();

private:
    using Address = metadata::MetadataPath;
    using Nodes = std::map<Address, std::shared_ptr<metadata::MetadataNode>>;

    void takeFrom(std::vector<Address> const& scopes);
    void takeBelow(Address address);
    void removeEmptied(std::vector<Move> const& moves, std::vector<Address> const& scopes);
    bool leave(std::u16string const& folder, std::vector<Address> const& scopes);
    bool isPlainAndEmptyInMoved(std::u16string const& path, std::vector<Address> const& scopes) const;
    bool isPlainAndEmpty(Address const& folder, std::vector<Address> const& scopes) const;
    void requireFree(std::vector<Move> const& moves) const;
    void addFoldersAbove(std::vector<Move> const& moves);
    void rewriteReferencesBelow(Address const& head);
    void remove(Address const& address);
    void set();

    std::vector<Address> scopes() const;
    std::vector<Address> heads() const;
    Address addressIn(Address const& scope, std::u16string_view path) const;
    std::u16string relative(Path const& path) const;

    stores::TreeMetadataManager& store_;
    Path const& root_;
    stores::PathMoves moves_;
    Nodes nodes_;                            ///< to be set
    std::vector<Address> created_;           ///< addresses without nodes, to be created
    std::map<Address, stores::Node> before_; ///< of all addresses that have changed
};

} // namespace project::session

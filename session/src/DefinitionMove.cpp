#include "DefinitionMove.hpp"

#include <string>
#include <string_view>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::session {

namespace schema = metadata::schema;

using metadata::getParentFolder;
using metadata::isParent;
using metadata::MetadataPath;
using metadata::PathElement;

void DefinitionMove::run(std::vector<Move> const& moves, EmptiedFolders emptied) {
    for (auto const& move : moves) {
        moves_.add(relative(move.from), relative(move.to), true);
    }
    auto const all = scopes();
    takeFrom(all);
    if (emptied == EmptiedFolders::Leave) {
        removeEmptied(moves, all);
    }
    requireFree(moves);
    addFoldersAbove(moves);
    for (auto const& head : heads()) {
        rewriteReferencesBelow(head);
    }
    set();
}

/// Removes everything that moves, and remembers it under its new address.
void DefinitionMove::takeFrom(std::vector<Address> const& scopes) {
    for (auto const& scope : scopes) {
        std::vector<Address> found;
        for (auto const& [from, target] : moves_.entries()) {
            auto address = addressIn(scope, from);
            if (store_.pathExists(address)) {
                takeBelow(address);
                found.push_back(std::move(address));
            }
        }
        store_.removeNodes(found);
    }
}

void DefinitionMove::takeBelow(Address address) {
    std::vector<Address> waiting{std::move(address)};
    while (!waiting.empty()) {
        auto const here = std::move(waiting.back());
        waiting.pop_back();
        auto below = store_.getChildNodes(here);
        auto const to = moves_.moved(here);
        std::shared_ptr<metadata::MetadataNode> node = store_.getNode(here);
        if (node) {
            before_.insert_or_assign(here, node);
            before_.try_emplace(*to, nullptr);
            nodes_.insert_or_assign(*to, std::move(node));
        } else if (below.empty()) {
            created_.push_back(*to);
        }
        std::move(below.begin(), below.end(), std::back_inserter(waiting));
    }
}

void DefinitionMove::removeEmptied(std::vector<Move> const& moves, std::vector<Address> const& scopes) {
    for (auto const& move : moves) {
        auto folder = getParentFolder(move.from);
        while (isParent(folder, root_) && leave(relative(folder), scopes)) {
            folder = getParentFolder(folder);
        }
    }
}

/// Lets a folder leave the project if it is empty and plain. @return false if it stays.
bool DefinitionMove::leave(std::u16string const& folder, std::vector<Address> const& scopes) {
    if (moves_.entries().contains(folder)) {
        return false; // it is moved itself
    }
    auto const moved = moves_.moved(folder);
    auto const address = addressIn(scopes.front(), moved ? *moved : folder);
    if (!moved && isPlainAndEmpty(address, scopes)) {
        remove(address);
        return true;
    }
    if (moved && isPlainAndEmptyInMoved(*moved, scopes)) {
        nodes_.erase(address.child(PathElement(schema::files::markerType, schema::files::markerLocation)));
        nodes_.erase(address);
        return true;
    }
    return false;
}

/// The same for a folder that moves with one above it.
bool DefinitionMove::isPlainAndEmptyInMoved(std::u16string const& path,
                                            std::vector<Address> const& scopes) const {
    for (auto const& scope : scopes) {
        bool const isList = scope == scopes.front();
        auto const address = addressIn(scope, path);
        auto const below = nodes_.lower_bound(address);
        bool const isPlain = below != nodes_.end() && below->first == address &&
                             metadata::isEqual(*below->second, *stores::plainNode());
        if (isList && !isPlain) {
            return false;
        }
        for (auto node = below; node != nodes_.end() && node->first.isWithin(address); ++node) {
            bool const isOwn =
                node->first == address || (node->first.parent() == address &&
                                           node->first.leaf().getType() == schema::files::markerType);
            if (!isList || !isOwn) {
                return false;
            }
        }
    }
    return true;
}

/// @param folder in the file list, which is the first scope.
bool DefinitionMove::isPlainAndEmpty(Address const& folder, std::vector<Address> const& scopes) const {
    auto const node = store_.getNode(folder);
    if (!node || !metadata::isEqual(*node, *stores::plainNode())) {
        return false;
    }
    for (auto const& child : store_.getChildNodes(folder)) {
        if (child.leaf().getType() != schema::files::markerType) {
            return false;
        }
    }
    auto const& steps = folder.getPath();
    for (auto const& scope : scopes) {
        auto address = scope;
        for (std::size_t step = 1; step < steps.size(); ++step) {
            address = address.child(steps[step]);
        }
        if (!(scope == scopes.front()) && store_.pathExists(address)) {
            return false;
        }
    }
    return true;
}

void DefinitionMove::requireFree(std::vector<Move> const& moves) const {
    auto const list = addressIn(MetadataPath::root(), {});
    for (auto const& move : moves) {
        if (store_.hasNode(addressIn(list, relative(move.to)))) {
            throw MoveError(MoveError::Reason::IsInProject, move);
        }
    }
}

void DefinitionMove::addFoldersAbove(std::vector<Move> const& moves) {
    auto const list = addressIn(MetadataPath::root(), {});
    auto const add = [this](Address const& address) {
        if (!nodes_.contains(address) && !store_.hasNode(address)) {
            before_.try_emplace(address, nullptr);
            nodes_.emplace(address, std::make_shared<metadata::MetadataNodeSpecification>(schema::nodeType));
        }
    };
    for (auto const& move : moves) {
        for (auto folder = getParentFolder(move.to); isParent(folder, root_);
             folder = getParentFolder(folder)) {
            auto const address = addressIn(list, relative(folder));
            bool const isThere = nodes_.contains(address) || store_.hasNode(address);
            if (!isThere) {
                add(address);
                add(address.child(PathElement(schema::files::markerType, schema::files::markerLocation)));
            }
        }
    }
}

void DefinitionMove::rewriteReferencesBelow(Address const& head) {
    for (auto const& address : store_.getChildNodes(head)) {
        stores::Node const node = store_.getNode(address);
        auto const moved = node ? moves_.moved(address, node, root_.native()) : node;
        if (moved != node && !metadata::isEqual(*moved, *node)) {
            before_.emplace(address, node);
            // The store never changes a node that it has got.
            nodes_.emplace(address, std::const_pointer_cast<metadata::MetadataNode>(moved));
        }
    }
}

/// Removes an address of the file list that has at most a marker below it.
void DefinitionMove::remove(Address const& address) {
    before_.insert_or_assign(address, store_.getNode(address));
    for (auto const& child : store_.getChildNodes(address)) {
        before_.insert_or_assign(child, store_.getNode(child));
    }
    std::vector<Address> addresses{address};
    store_.removeNodes(addresses);
}

void DefinitionMove::set() {
    store_.setNodes(nodes_);
    if (!created_.empty()) {
        store_.createPaths(created_);
    }
}

stores::Changes DefinitionMove::takeChanges() {
    stores::Changes result;
    for (auto const& [address, before] : before_) {
        stores::Node after = store_.getNode(address);
        bool const isSame = before && after ? metadata::isEqual(*before, *after) : before == after;
        if (!isSame) {
            result.differences.push_back({address, before, std::move(after)});
        }
    }
    return result;
}

/// The heads of all scopes, that of the file list first.
std::vector<MetadataPath> DefinitionMove::scopes() const {
    std::vector<Address> result{addressIn(MetadataPath::root(), {})};
    for (auto const& head : store_.getChildNodes(MetadataPath::root())) {
        if (head.leaf().getType() == schema::files::filesType && !(head == result.front())) {
            result.push_back(head);
        }
    }
    return result;
}

/// The heads of the subtrees whose nodes refer to files.
std::vector<MetadataPath> DefinitionMove::heads() const {
    std::vector<Address> result;
    for (auto const* type : {schema::entrypoints::entryPointsType, schema::references::projectPathType,
                             schema::references::referencesType}) {
        result.push_back(MetadataPath::root().child(PathElement(type, schema::rootLocation)));
    }
    return result;
}

/// The address of a path in a scope. @param scope the root's address for the file list.
MetadataPath DefinitionMove::addressIn(Address const& scope, std::u16string_view path) const {
    auto result = scope.depth() > 0
                      ? scope
                      : scope.child(PathElement(schema::files::filesType, schema::files::fileListScope));
    for (; !path.empty(); path = fl::filesystem::detail::move_down(path)) {
        result = result.child(PathElement(
            schema::files::fileType, std::u16string(fl::filesystem::detail::extract_first_element(path))));
    }
    return result;
}

std::u16string DefinitionMove::relative(Path const& path) const {
    return metadata::getRelativePath(root_, path);
}

} // namespace project::session

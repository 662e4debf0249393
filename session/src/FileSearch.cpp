#include "FileSearch.hpp"

#include <set>
#include <vector>

#include "FileConditions.hpp"
#include "FileTree.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace project::session {

namespace {

/// The paths of a query in the order of the store, without those below another one: these are visited with
/// it.
std::vector<Path> startsOf(Query const& query, Path const& root) {
    if (query.paths.empty()) {
        return {root};
    }
    std::vector<Path> result;
    for (auto const& path : std::set<Path>(query.paths.begin(), query.paths.end())) {
        bool const isInside = path == root || metadata::isParent(path, root);
        if (isInside && (result.empty() || !metadata::isParent(path, result.back()))) {
            result.push_back(path);
        }
    }
    return result;
}

} // namespace

void visitFound(Query const& query, stores::TreeMetadataManager& store, stores::TreeMetadataManager& personal,
                Path const& root, FileVisitor const& visitor) {
    FileTree const files(store, root);
    FileConditions const conditions(query, store, personal, root);
    for (auto const& start : startsOf(query, root)) {
        files.visit(start, [&](VisitedFile const& file) {
            if (conditions.hold(file)) {
                visitor(file);
            }
        });
    }
}

} // namespace project::session

#include "sync/Followed.hpp"

#include <set>

#include "files/MoveFailure.hpp"
#include "renames/FindRenames.hpp"

namespace projectctl {

using project::session::Move;
using project::session::MoveError;
using project::session::SyncPlan;

namespace {

/// The paths that a plan changes, and the folders whose rules have to follow.
std::set<Path> pathsOf(OpenProject& project, SyncPlan const& plan) {
    std::set<Path> result;
    for (auto const& rule : project.session().syncRules()) {
        result.insert(rule.folder);
    }
    for (auto const& file : plan.added) {
        result.insert(file.path);
    }
    for (auto const& removed : plan.removed) {
        result.insert(removed.file.path);
    }
    return result;
}

} // namespace

std::vector<Move> followRenames(OpenProject& project, SyncPlan const& plan) {
    std::vector<Move> result;
    auto const changed = pathsOf(project, plan);
    for (auto const& rename : findRenames(project).pairs) {
        Move const move{project.root() / Path(rename.from), project.root() / Path(rename.to)};
        bool const isOfPlan = changed.contains(move.from) || changed.contains(move.to);
        if (isOfPlan && rename.evidence != Rename::Evidence::Name) {
            result.push_back(move);
        }
    }
    try {
        project.adopt(result);
    } catch (MoveError const& error) {
        throw failureOf(error);
    }
    return result;
}

} // namespace projectctl

#include "checks/SyncCheck.hpp"

#include <string_view>

#include "project/metadata/MetadataFunctions.hpp"
#include "texts/Message.hpp"

namespace projectctl {

Findings findOutOfDate(OpenProject& project, ShownPaths shown) {
    Findings result;
    auto const add = [&](std::string_view code, char const* text, Path const& path) {
        result.push_back(Finding::fault(code, Message(text, shown.ofAbsolute(path)))
                             .about(project::metadata::getRelativePath(project.root(), path)));
    };
    auto const plan = project.session().planSync();
    for (auto const& folder : plan.missing) {
        add(code::syncFolderMissing, "FindingSyncFolderMissing", folder);
    }
    for (auto const& folder : plan.absent) {
        result.push_back(Finding::note(code::syncFolderAbsent,
                                       Message("FindingSyncFolderAbsent", shown.ofAbsolute(folder)))
                             .about(project::metadata::getRelativePath(project.root(), folder)));
    }
    for (auto const& file : plan.added) {
        add(code::syncNew, "FindingSyncNew", file.path);
    }
    for (auto const& removed : plan.removed) {
        add(code::syncGone, "FindingSyncGone", removed.file.path);
    }
    return result;
}

} // namespace projectctl

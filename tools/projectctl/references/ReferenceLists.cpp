#include "references/ReferenceLists.hpp"

#include <exception>

#include "project/Schema.hpp"
#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"

namespace projectctl {

ReferenceList const& projectPath() {
    static ReferenceList const list{
        [](OpenProject& project) -> project::management::FolderReferenceManager& {
            return project.manager().getProjectPathManager().getFolderReferenceManager();
        },
        schema::projectPath, "the project path", false};
    return list;
}

ReferenceList const& projectReferences() {
    static ReferenceList const list{
        [](OpenProject& project) -> project::management::FolderReferenceManager& {
            return project.manager().getProjectReferenceManager().getFolderReferenceManager();
        },
        schema::references, "the referenced projects", true};
    return list;
}

Path followed(Path const& path) {
    try {
        return fl::filesystem::canonical(path, Path());
    } catch (std::exception const&) {
        return path;
    }
}

} // namespace projectctl

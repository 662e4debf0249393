#include "references/ReferenceLists.hpp"

#include <exception>

#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace referenceSchema = project::metadata::schema::references;

ReferenceList const& projectPath() {
    static ReferenceList const list{
        [](OpenProject& project) -> project::management::FolderReferenceManager& {
            return project.manager().getProjectPathManager().getFolderReferenceManager();
        },
        referenceSchema::projectPathType, false};
    return list;
}

ReferenceList const& projectReferences() {
    static ReferenceList const list{
        [](OpenProject& project) -> project::management::FolderReferenceManager& {
            return project.manager().getProjectReferenceManager().getFolderReferenceManager();
        },
        referenceSchema::referencesType, true};
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

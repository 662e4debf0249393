#include "checks/ReferenceCheck.hpp"

#include <set>
#include <utility>

#include "output/NameForms.hpp"
#include "project/ProjectFolder.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/references/FolderReference.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::metadata::MetadataPath;
using project::metadata::PathElement;

namespace {

MetadataPath headOf(ReferenceList const& list) {
    return MetadataPath::root().child(PathElement(std::u16string(list.head), treeSchema::rootLocation));
}

std::string subjectOf(ReferenceList const& list, std::u16string_view name) {
    return Message(list.isOfProjects ? "ReferenceInProjects" : "ReferenceInPath", name).text();
}

} // namespace

Findings ReferenceCheck::run() {
    for (auto const* list : {&projectPath(), &projectReferences()}) {
        auto const references = list->manager(project_).getReferences();
        checkForms(*list, references);
        checkTargets(*list, references);
    }
    return std::move(findings_);
}

void ReferenceCheck::checkForms(ReferenceList const& list, References const& references) {
    std::set<std::u16string> read;
    for (auto const& reference : references) {
        read.insert(reference.getUUID());
    }
    for (auto const& address : project_.store().getChildNodes(headOf(list))) {
        auto const& uuid = address.leaf().getLocation();
        auto const node = project_.store().getNode(address);
        bool const isReference = node && address.leaf().getType() == treeSchema::references::referenceType;
        if (isReference && !read.contains(uuid)) {
            findings_.push_back(Finding::note(code::referenceTypeUnsupported,
                                              Message("ReferenceTypeUnsupported", subjectOf(list, uuid),
                                                      node->get(treeSchema::references::typeKey)))
                                    .at(address));
        }
    }
}

void ReferenceCheck::checkTargets(ReferenceList const& list, References const& references) {
    for (auto const& reference : references) {
        auto const& folder = reference.getLocation();
        auto const address =
            headOf(list).child(PathElement(treeSchema::references::referenceType, reference.getUUID()));
        auto const subject = subjectOf(list, shown_.of(reference.getStoredPath()));
        if (!project::metadata::is_directory(folder)) {
            findings_.push_back(Finding::note(code::referenceFolderMissing,
                                              Message("ReferenceFolderMissing", subject, folder))
                                    .at(address));
        } else if (list.isOfProjects && findProjectIn(folder) == ProjectTrace::None) {
            findings_.push_back(Finding::note(code::referenceProjectMissing,
                                              Message("ReferenceProjectMissing", subject, folder))
                                    .at(address));
        }
    }
}

} // namespace projectctl

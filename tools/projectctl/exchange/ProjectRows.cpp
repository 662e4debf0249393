#include "exchange/ProjectRows.hpp"

#include <map>

#include "exchange/LabelData.hpp"
#include "output/NameForms.hpp"
#include "project/FileList.hpp"
#include "project/LabelsOnFile.hpp"
#include "project/core/LabelManager.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/LabelIdentifier.hpp"

namespace projectctl {

namespace {

struct LabelNamesOfProject {
    std::u16string category;
    std::u16string label;
};

std::map<LabelUUIDs, LabelNamesOfProject> allLabels(OpenProject& project) {
    auto& labels = project.manager().getLabelManager();
    std::map<LabelUUIDs, LabelNamesOfProject> result;
    for (auto const& category : labels.getAllCategories()) {
        for (auto const& label : labels.getLabels(category)) {
            result.emplace(LabelUUIDs(category.getUUID(), label.getUUID()),
                           LabelNamesOfProject{category.getName(), label.getName()});
        }
    }
    return result;
}

} // namespace

void visitRows(OpenProject& project, Unmapped& unmapped, RowVisitor const& visitor) {
    FileList const files(project);
    LabelData const data(project);
    auto const names = allLabels(project);
    files.visit(project.root(), [&](FileList::File const& file) {
        bool isVisited = false;
        for (auto const& uuids : labelsOn(file.node)) {
            auto const found = names.find(uuids);
            bool const isNamed =
                found != names.end() && (!found->second.category.empty() || !found->second.label.empty());
            if (isNamed) {
                auto const& [category, label] = found->second;
                visitor({file.path, category, label, data.of(project.root() / Path(file.path), uuids.second)},
                        file.kind);
                isVisited = true;
            } else {
                unmapped.add(0, Message("LabelDeleted", file.path));
            }
        }
        if (!isVisited) {
            visitor({file.path, {}, {}, {}}, file.kind);
        }
    });
}

} // namespace projectctl

#include "checks/LabelCheck.hpp"

#include <cstddef>
#include <utility>

#include "output/NameForms.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::metadata::MetadataPath;
using project::metadata::PathElement;

LabelCheck::LabelCheck(project::metadata::MetadataManager& store) {
    auto const head = MetadataPath::root().child(
        PathElement(treeSchema::categories::categoriesType, treeSchema::rootLocation));
    for (auto const& address : store.getChildNodes(head)) {
        auto const node = store.getNode(address);
        if (!node || address.leaf().getType() != treeSchema::categories::categoryType) {
            continue;
        }
        auto& category = categories_[address.leaf().getLocation()];
        category.name = node->get(treeSchema::categories::categoryNameKey);
        category.isSingleValued =
            node->get(treeSchema::categories::categorySingleValuedKey) == treeSchema::categories::flagTrue;
        for (auto const& below : store.getChildNodes(address)) {
            auto const label = store.getNode(below);
            if (below.leaf().getType() == treeSchema::categories::labelType && label) {
                category.labels.emplace(below.leaf().getLocation(),
                                        label->get(treeSchema::categories::labelNameKey));
            }
        }
    }
}

void LabelCheck::check(CheckedFile const& subject, Node const& node, ShownPaths& shown,
                       Findings& findings) const {
    if (node.getChildren().empty()) {
        return;
    }
    std::u16string const file(shown.of(subject.path));
    Findings found;
    for (auto const& [category, labels] : labelsOn(node)) {
        checkCategory(file, category, labels, found);
    }
    for (auto& finding : found) {
        findings.push_back(std::move(finding).at(subject.address()).about(subject.path));
    }
}

std::map<std::u16string, LabelCheck::Counts> LabelCheck::labelsOn(Node const& node) {
    std::map<std::u16string, Counts> result;
    for (auto const& category : node.getChildren()) {
        std::u16string const uuid = category->get(treeSchema::files::categoryUUIDKey);
        if (category->getType() != treeSchema::files::categoryType || uuid.empty()) {
            continue; // no reader uses it
        }
        for (auto const& label : category->getChildren()) {
            if (label->getType() == treeSchema::files::labelType &&
                !label->get(treeSchema::files::labelUUIDKey).empty()) {
                ++result[uuid][label->get(treeSchema::files::labelUUIDKey)];
            }
        }
    }
    return result;
}

void LabelCheck::checkCategory(std::u16string const& file, std::u16string const& uuid, Counts const& labels,
                               Findings& findings) const {
    auto const category = categories_.find(uuid);
    if (category == categories_.end()) {
        findings.push_back(Finding::fault(code::categoryMissing, Message("CategoryMissing", file, uuid)));
        return;
    }
    auto const& name = category->second.name;
    std::size_t total = 0;
    for (auto const& [label, count] : labels) {
        auto const known = category->second.labels.find(label);
        total += count;
        if (known == category->second.labels.end()) {
            findings.push_back(
                Finding::fault(code::labelMissing, Message("LabelMissing", file, label, name)));
        } else if (count > 1 && !category->second.isSingleValued) {
            findings.push_back(Finding::note(code::labelRepeated,
                                             Message("LabelRepeated", file, known->second, name, count)));
        }
    }
    if (category->second.isSingleValued && total > 1) {
        findings.push_back(
            Finding::fault(code::labelsContradict, Message("LabelsContradict", file, total, name)));
    }
}

} // namespace projectctl

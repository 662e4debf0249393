#include "checks/EntryPointCheck.hpp"

#include <utility>

#include "output/NameForms.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/entrypoints/EntryPointGroup.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::metadata::MetadataPath;
using project::metadata::PathElement;

Findings EntryPointCheck::run() {
    for (auto const& group : project_.manager().getEntryPointManager().getEntryPointGroups()) {
        groups_.insert(group->getUUID());
    }
    auto const head = MetadataPath::root().child(
        PathElement(treeSchema::entrypoints::entryPointsType, treeSchema::rootLocation));
    for (auto const& address : project_.store().getChildNodes(head)) {
        if (auto const node = project_.store().getNode(address)) {
            check(address.leaf().getLocation(), *node);
        }
    }
    for (auto const& [file, count] : files_) {
        if (count > 1) {
            findings_.push_back(
                Finding::fault("the file " + inQuotes(shown_.of(file)) + " has " + std::to_string(count) +
                               " entry points, but only the first one can be found by its path"));
        }
    }
    return std::move(findings_);
}

void EntryPointCheck::check(std::u16string const& uuid, Node const& node) {
    auto const& file = node.get(treeSchema::entrypoints::fileKey);
    std::string const entry =
        "the entry point " + inQuotes(uuid) + " of the file " + inQuotes(shown_.of(file));
    ++files_[file];
    checkFile(entry, file);
    auto const& group = node.get(treeSchema::entrypoints::groupUUIDKey);
    if (!group.empty() && !groups_.contains(group)) {
        findings_.push_back(
            Finding::fault(entry + " is in the group " + inQuotes(group) + ", which does not exist"));
    }
}

void EntryPointCheck::checkFile(std::string const& entry, std::u16string const& file) {
    auto const path = project_.root() / Path(file);
    if (!project_.files().isFileInProject(path)) {
        findings_.push_back(Finding::note(entry + " is not shown, because the file is not in the project"));
    } else if (!project::metadata::exists(path)) {
        findings_.push_back(Finding::note(entry + " cannot be used, because the file is not on disk"));
    }
}

} // namespace projectctl

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
            check(address, *node);
        }
    }
    for (auto const& [file, addresses] : files_) {
        if (addresses.size() > 1) {
            add(Finding::fault(code::entryRepeated,
                               Message("EntryRepeated", shown_.of(file), addresses.size())),
                addresses[1], file);
        }
    }
    return std::move(findings_);
}

void EntryPointCheck::check(MetadataPath const& address, Node const& node) {
    auto const& file = node.get(treeSchema::entrypoints::fileKey);
    auto const entry = Message("FindingEntry", address.leaf().getLocation(), shown_.of(file)).text();
    files_[file].push_back(address);
    checkFile(entry, file, address);
    auto const& group = node.get(treeSchema::entrypoints::groupUUIDKey);
    if (!group.empty() && !groups_.contains(group)) {
        add(Finding::fault(code::groupMissing, Message("GroupMissing", entry, group)), address, file);
    }
}

void EntryPointCheck::checkFile(std::string const& entry, std::u16string const& file,
                                MetadataPath const& address) {
    auto const path = project_.root() / Path(file);
    if (!project_.files().isFileInProject(path)) {
        add(Finding::note(code::entryFileNotListed, Message("EntryFileNotListed", entry)), address, file);
    } else if (!project::metadata::exists(path)) {
        add(Finding::note(code::entryFileGone, Message("EntryFileGone", entry)), address, file);
    }
}

void EntryPointCheck::add(Finding finding, MetadataPath const& address, std::u16string const& file) {
    findings_.push_back(std::move(finding).at(address).about(file));
}

} // namespace projectctl

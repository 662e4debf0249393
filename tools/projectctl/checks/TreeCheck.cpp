#include "checks/TreeCheck.hpp"

#include <algorithm>
#include <string_view>
#include <utility>

#include "checks/EntryPointCheck.hpp"
#include "checks/NameCheck.hpp"
#include "checks/ReferenceCheck.hpp"
#include "fl/filesystem/SystemName.hpp"
#include "output/NameForms.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using fl::filesystem::Path;
using project::management::ProjectManagerBase;
using project::metadata::MetadataPath;

namespace {

/// The steps of an address, for findings about nodes that have no name.
std::string described(MetadataPath const& address) {
    std::string result;
    for (auto const& element : address.getPath()) {
        result += (result.empty() ? "(" : ", (") + inQuotes(element.getType()) + ", " +
                  inQuotes(element.getLocation()) + ')';
    }
    return result;
}

/// A file's path in its scope. @param address of the file or of something that belongs to it.
std::u16string pathOf(MetadataPath const& address) {
    std::u16string result;
    for (std::size_t index = 1; index < address.depth(); ++index) {
        if (address[index].getType() == treeSchema::files::fileType) {
            result += (result.empty() ? u"" : u"/") + address[index].getLocation();
        }
    }
    return result;
}

bool isPossibleName(std::u16string const& name) {
    return !name.empty() && name != u"." && name != u".." && name.find(u'/') == std::u16string::npos &&
           fl::filesystem::SystemName(Path(name)).get() != nullptr;
}

bool isOneOf(std::u16string const& text, std::initializer_list<std::u16string_view> known) {
    return std::ranges::find(known, std::u16string_view(text)) != known.end();
}

} // namespace

TreeCheck::TreeCheck(OpenProject& project, ShownPaths shown)
    : project_(project),
      store_(project.store()),
      guard_(store_.acquireReadLock()),
      labels_(store_),
      shown_(std::move(shown)) {
}

Findings TreeCheck::run() {
    for (auto const& head : store_.getChildNodes(MetadataPath::root())) {
        checkHead(head);
    }
    append(findings_, EntryPointCheck(project_, shown_).run());
    append(findings_, ReferenceCheck(project_, shown_).run());
    return std::move(findings_);
}

void TreeCheck::checkHead(Address const& head) {
    auto const leaf = head.getLeaf();
    bool const isRoot = leaf.getLocation() == treeSchema::rootLocation;
    if (leaf.getType() == treeSchema::files::filesType) {
        checkFiles(head);
    } else if (isRoot && leaf.getType() == treeSchema::categories::categoriesType) {
        checkCategories(head);
    } else if (isRoot && leaf.getType() == treeSchema::entrypoints::entryPointsType) {
        checkEntryPoints(head);
    } else if (isRoot && leaf.getType() == treeSchema::entrypoints::groupsType) {
        checkGroups(head);
    } else if (isRoot && isOneOf(leaf.getType(), {treeSchema::references::projectPathType,
                                                  treeSchema::references::referencesType})) {
        checkReferences(head);
    } else if (head != ProjectManagerBase::getRootNodePath() &&
               head != ProjectManagerBase::getDescriptionNodePath().parent()) {
        add(Finding::note(code::dataUnused, Message("DataUnused", described(head))), head);
    }
}

void TreeCheck::checkFiles(Address const& scope) {
    std::vector<Address> waiting{scope};
    while (!waiting.empty()) {
        auto const address = std::move(waiting.back());
        waiting.pop_back();
        if (address != scope) {
            checkFile(address);
        }
        auto below = store_.getChildNodes(address);
        std::erase_if(below, [](Address const& child) { // folders' markers, label data
            return child.leaf().getType() != treeSchema::files::fileType;
        });
        waiting.insert(waiting.end(), std::make_move_iterator(below.rbegin()),
                       std::make_move_iterator(below.rend()));
    }
}

void TreeCheck::checkFile(Address const& file) {
    if (!isPossibleName(file.leaf().getLocation())) {
        add(Finding::fault(code::nameImpossible,
                           Message("NameImpossible", file.leaf().getLocation(), described(file))),
            file);
    }
    auto const node = store_.getNode(file);
    if (!node) {
        return; // the files below it are reported
    }
    auto const above = file.parent();
    bool const isRule = file[0].getLocation() == treeSchema::sync::rulesScope; // folders above need none
    if (!isRule && above.depth() > 1 && !store_.hasNode(above)) {
        add(Finding::fault(code::folderNotListed, Message("FolderNotListed", shown_.of(pathOf(file)))), file);
    }
    if (file[0].getLocation() == treeSchema::rootLocation) {
        auto const path = pathOf(file);
        CheckedFile const subject{path, [&file] { return file; }};
        checkName(subject, shown_, findings_);
        labels_.check(subject, *node, shown_, findings_);
    }
}

void TreeCheck::checkCategories(Address const& head) {
    for (auto const& category : store_.getChildNodes(head)) {
        requireNode(category, "NodelessCategory");
        checkLabels(category);
    }
}

void TreeCheck::checkLabels(Address const& category) {
    for (auto const& label : store_.getChildNodes(category)) {
        if (!requireNode(label, "NodelessLabel")) {
            continue;
        }
        std::u16string const state = store_.getNode(label)->get(treeSchema::categories::labelReadOnlyKey);
        if (!isOneOf(state, {u"", u"READ_ONLY", u"WRITABLE", u"INHERITED"})) {
            add(Finding::fault(code::labelStateUnknown,
                               Message("LabelStateUnknown", label.leaf().getLocation(), state)),
                label);
        }
    }
}

void TreeCheck::checkEntryPoints(Address const& head) {
    for (auto const& entryPoint : store_.getChildNodes(head)) {
        if (!requireNode(entryPoint, "NodelessEntry")) {
            continue;
        }
        auto const node = store_.getNode(entryPoint);
        auto const& type = node->get(treeSchema::entrypoints::typeKey);
        if (!isOneOf(type, {u"Basic", u"Startup", u"StartUp", u"Shutdown", u"Batch_Job", u"Batch Job"})) {
            add(Finding::fault(code::entryTypeUnknown,
                               Message("EntryOfUnknownType", entryPoint.leaf().getLocation(), type)),
                entryPoint);
        }
    }
}

void TreeCheck::checkGroups(Address const& head) {
    for (auto const& group : store_.getChildNodes(head)) {
        requireNode(group, "NodelessGroup");
    }
}

void TreeCheck::checkReferences(Address const& head) {
    for (auto const& reference : store_.getChildNodes(head)) {
        requireNode(reference, "NodelessReference");
    }
}

bool TreeCheck::requireNode(Address const& address, char const* message) {
    if (store_.hasNode(address)) {
        return true;
    }
    add(Finding::fault(code::nodeMissing, Message(message, address.leaf().getLocation())), address);
    return false;
}

void TreeCheck::add(Finding finding, Address const& address) {
    bool const isFile = address[0].getType() == treeSchema::files::filesType;
    findings_.push_back(std::move(finding).at(address).about(isFile ? pathOf(address) : std::u16string()));
}

} // namespace projectctl

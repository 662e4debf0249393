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
        add(Finding::note(code::dataUnused, "this version does not use the data at " + described(head)),
            head);
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
        add(Finding::fault(code::nameImpossible, "no file can have the name " +
                                                     inQuotes(file.leaf().getLocation()) + ", at " +
                                                     described(file)),
            file);
    }
    auto const node = store_.getNode(file);
    if (!node) {
        return; // the files below it are reported
    }
    auto const above = file.parent();
    if (above.depth() > 1 && !store_.hasNode(above)) {
        add(Finding::fault(code::folderNotListed,
                           "the file " + inQuotes(shown_.of(pathOf(file))) +
                               " is in the project but its folder is not, so listings do not show it"),
            file);
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
        requireNode(category, "the category");
        checkLabels(category);
    }
}

void TreeCheck::checkLabels(Address const& category) {
    for (auto const& label : store_.getChildNodes(category)) {
        if (!requireNode(label, "the label")) {
            continue;
        }
        std::u16string const state = store_.getNode(label)->get(treeSchema::categories::labelReadOnlyKey);
        if (!isOneOf(state, {u"", u"READ_ONLY", u"WRITABLE", u"INHERITED"})) {
            add(Finding::fault(code::labelStateUnknown, "the label " + inQuotes(label.leaf().getLocation()) +
                                                            " has the unknown read-only state " +
                                                            inQuotes(state)),
                label);
        }
    }
}

void TreeCheck::checkEntryPoints(Address const& head) {
    for (auto const& entryPoint : store_.getChildNodes(head)) {
        if (!requireNode(entryPoint, "the entry point")) {
            continue;
        }
        auto const node = store_.getNode(entryPoint);
        std::string const uuid = inQuotes(entryPoint.leaf().getLocation());
        auto const& type = node->get(treeSchema::entrypoints::typeKey);
        if (!isOneOf(type, {u"Basic", u"Startup", u"StartUp", u"Shutdown", u"Batch_Job", u"Batch Job"})) {
            add(Finding::fault(code::entryTypeUnknown,
                               "the entry point " + uuid + " has the unknown type " + inQuotes(type)),
                entryPoint);
        }
    }
}

void TreeCheck::checkGroups(Address const& head) {
    for (auto const& group : store_.getChildNodes(head)) {
        requireNode(group, "the entry point group");
    }
}

void TreeCheck::checkReferences(Address const& head) {
    for (auto const& reference : store_.getChildNodes(head)) {
        requireNode(reference, "the reference");
    }
}

bool TreeCheck::requireNode(Address const& address, std::string const& kind) {
    if (store_.hasNode(address)) {
        return true;
    }
    add(Finding::fault(code::nodeMissing, kind + ' ' + inQuotes(address.leaf().getLocation()) +
                                              " has an address without a node"),
        address);
    return false;
}

void TreeCheck::add(Finding finding, Address const& address) {
    bool const isFile = address[0].getType() == treeSchema::files::filesType;
    findings_.push_back(std::move(finding).at(address).about(isFile ? pathOf(address) : std::u16string()));
}

} // namespace projectctl

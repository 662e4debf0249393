#include "changes/ChangeLines.hpp"

#include <algorithm>
#include <utility>

#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::management::ProjectManagerBase;
using project::metadata::MetadataPath;
using project::metadata::PathElement;
using project::stores::Difference;
using project::stores::Node;

namespace {

/// A label of a file: the UUIDs of its category and its own.
using LabelOnFile = std::pair<std::u16string, std::u16string>;

/// @param node null for none. @return sorted; a label that the file has twice is there twice.
std::vector<LabelOnFile> labelsOf(Node const& node) {
    std::vector<LabelOnFile> result;
    if (node) {
        for (auto const& category : node->getChildren()) {
            for (auto const& label : category->getChildren()) {
                result.emplace_back(category->get(treeSchema::files::categoryUUIDKey),
                                    label->get(treeSchema::files::labelUUIDKey));
            }
        }
    }
    std::ranges::sort(result);
    return result;
}

std::vector<LabelOnFile> without(std::vector<LabelOnFile> const& labels,
                                 std::vector<LabelOnFile> const& others) {
    std::vector<LabelOnFile> result;
    std::ranges::set_difference(labels, others, std::back_inserter(result));
    return result;
}

std::string quotedName(std::u16string_view text) {
    std::string bytes;
    appendBytes(bytes, text);
    std::string result;
    appendQuoted(result, bytes);
    return result;
}

void writeChange(std::string_view words, std::string const& text) {
    output().text().append(words).append(1, ' ').append(text).append(1, '\n');
    output().flushWhenLarge();
}

MetadataPath categoryAddress(std::u16string const& uuid) {
    return MetadataPath::root()
        .child(PathElement(treeSchema::categories::categoriesType, treeSchema::rootLocation))
        .child(PathElement(treeSchema::categories::categoryType, uuid));
}

/// A value before a change, or after it if there was none before.
std::u16string const& earliest(Difference const& change, char16_t const* key) {
    return (change.before ? change.before : change.after)->get(key);
}

} // namespace

ChangeLines::ChangeLines(OpenProject& project, std::vector<Difference> const& changes)
    : project_(project), changes_(changes), shown_(project.root()) {
}

void ChangeLines::write() {
    for (auto const& change : changes_) {
        write(change);
    }
}

void ChangeLines::write(Difference const& change) {
    auto const& address = change.address;
    auto const& head = address[0].getType();
    auto const depth = address.depth();
    if (head == treeSchema::files::filesType) {
        writeFile(change);
    } else if (head == treeSchema::categories::categoriesType && depth == 2) {
        writeNamed("category", change, {});
    } else if (head == treeSchema::categories::categoriesType && depth == 3) {
        writeNamed("label", change, nameAt(address.parent()));
    } else if (head == treeSchema::entrypoints::groupsType && depth == 2) {
        writeNamed("group", change, {});
    } else if (head == treeSchema::entrypoints::entryPointsType && depth == 2) {
        writeEntry(change);
    } else if (head == treeSchema::references::projectPathType && depth == 2) {
        writeReference("path", change);
    } else if (head == treeSchema::references::referencesType && depth == 2) {
        writeReference("reference", change);
    } else if (address == ProjectManagerBase::getRootNodePath() && change.after) {
        writeChange("name", quotedName(change.after->get(treeSchema::information::nameKey)));
    } else if (address == ProjectManagerBase::getDescriptionNodePath() && change.after) {
        writeChange("description", quotedName(change.after->get(treeSchema::information::descriptionKey)));
    } else {
        writeOther(change);
    }
}

void ChangeLines::writeFile(Difference const& change) {
    bool const isInList = change.address[0].getLocation() == treeSchema::files::fileListScope;
    if (!isInList || change.address.leaf().getType() != treeSchema::files::fileType) {
        writeDataOfFile(change);
        return;
    }
    auto const path = pathOf(change.address);
    if (!change.after) {
        writeChange("remove", quotedName(shown_.of(path)));
        return;
    }
    if (!change.before) {
        writeChange("add", quotedName(shown_.of(path)));
    }
    writeLabelsOfFile(change, path);
}

void ChangeLines::writeLabelsOfFile(Difference const& change, std::u16string_view path) {
    auto const before = labelsOf(change.before);
    auto const after = labelsOf(change.after);
    auto const writeLabel = [&](std::string_view word, LabelOnFile const& label) {
        auto const category = categoryAddress(label.first);
        auto const own = category.child(PathElement(treeSchema::categories::labelType, label.second));
        writeChange(word, quotedName(nameAt(category)) + '=' + quotedName(nameAt(own)) + ' ' +
                              quotedName(shown_.of(path)));
    };
    for (auto const& label : without(before, after)) {
        writeLabel("take", label);
    }
    for (auto const& label : without(after, before)) {
        writeLabel("put", label);
    }
    if (change.before && before == after) {
        writeChange("change", quotedName(shown_.of(path)));
    }
}

/// Data that belongs to a file whose own node has changed needs no line.
void ChangeLines::writeDataOfFile(Difference const& change) {
    bool const isInList = change.address[0].getLocation() == treeSchema::files::fileListScope;
    if (isOfRemovedFile(change.address) || (isInList && find(change.address.parent()) != nullptr)) {
        return;
    }
    isInList ? writeChange("change", quotedName(shown_.of(pathOf(change.address)))) : writeOther(change);
}

void ChangeLines::writeNamed(std::string_view kind, Difference const& change, std::u16string const& owner) {
    constexpr auto const* key = treeSchema::categories::categoryNameKey;
    static_assert(std::u16string_view(key) == treeSchema::categories::labelNameKey);
    static_assert(std::u16string_view(key) == treeSchema::entrypoints::groupNameKey);
    auto text = (owner.empty() ? std::string() : quotedName(owner) + '=') + quotedName(earliest(change, key));
    auto const* word = !change.before ? " create" : !change.after ? " delete" : " rename";
    if (change.before && change.after) {
        text += '=' + quotedName(change.after->get(key));
    }
    writeChange(std::string(kind) + word, text);
}

void ChangeLines::writeReference(std::string_view kind, Difference const& change) {
    writeChange(std::string(kind) + (change.after ? " add" : " remove"),
                quotedName(earliest(change, treeSchema::references::storedPathKey)));
}

void ChangeLines::writeEntry(Difference const& change) {
    writeChange(change.after ? "entry set" : "entry remove",
                quotedName(shown_.of(earliest(change, treeSchema::entrypoints::fileKey))));
}

void ChangeLines::writeOther(Difference const& change) {
    std::string steps;
    for (auto const& step : change.address.getPath()) {
        steps +=
            (steps.empty() ? "" : " ") + quotedName(step.getType()) + ' ' + quotedName(step.getLocation());
    }
    writeChange("other", steps);
}

bool ChangeLines::isOfRemovedFile(Address const& address) const {
    auto file = MetadataPath::root().child(
        PathElement(treeSchema::files::filesType, treeSchema::files::fileListScope));
    for (std::size_t step = 1; step < address.depth(); ++step) {
        if (address[step].getType() == treeSchema::files::fileType) {
            file = file.child(address[step]);
        }
    }
    auto const* const change = find(file);
    return change != nullptr && !change->after;
}

Difference const* ChangeLines::find(Address const& address) const {
    auto const found = std::lower_bound(
        changes_.begin(), changes_.end(), address,
        [](Difference const& change, Address const& wanted) { return change.address < wanted; });
    return found != changes_.end() && found->address == address ? &*found : nullptr;
}

std::u16string ChangeLines::nameAt(Address const& address) const {
    std::shared_ptr<project::metadata::MetadataNode const> node = project_.store().getNode(address);
    if (auto const* const change = find(address); !node && change != nullptr) {
        node = change->before;
    }
    auto name = node ? node->get(treeSchema::categories::categoryNameKey) : std::u16string();
    return name.empty() ? address.leaf().getLocation() : name;
}

/// The path of a file, relative to the root, from its address or from one that belongs to it.
std::u16string ChangeLines::pathOf(Address const& address) {
    std::u16string result;
    for (std::size_t step = 1; step < address.depth(); ++step) {
        if (address[step].getType() == treeSchema::files::fileType) {
            result += (result.empty() ? u"" : u"/") + address[step].getLocation();
        }
    }
    return result;
}

} // namespace projectctl

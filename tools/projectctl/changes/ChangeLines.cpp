#include "changes/ChangeLines.hpp"

#include <algorithm>
#include <utility>

#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/stores/TreeMetadataManager.hpp"

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

void ChangeLines::write(std::vector<Difference> const& changes) {
    changes_ = changes;
    isPersonal_ = false;
    writeAll();
}

void ChangeLines::writePersonal(std::vector<Difference> const& changes) {
    changes_ = changes;
    isPersonal_ = true;
    writeAll();
}

void ChangeLines::finish() {
    if (isJson_) {
        rows_.finish();
    }
}

void ChangeLines::writeAll() {
    for (auto const& change : changes_) {
        write(change);
    }
}

/// A line consists of the words, the texts with "=" between them, and the path.
void ChangeLines::write(std::string_view words, std::vector<Member> const& members) {
    if (isJson_) {
        rows_.begin();
        rows_.addText("change", std::u16string(words.begin(), words.end()));
        for (auto const& member : members) {
            rows_.addText(member.key, member.text);
        }
        markPersonal();
        return;
    }
    std::string line = (isPersonal_ ? "personal " : "") + std::string(words);
    for (auto const& member : members) {
        bool const isPath = member.key == "path";
        line += isPath || &member == &members.front() ? ' ' : '=';
        line += isPath ? quotedName(shown_.of(member.text)) : quotedName(member.text);
    }
    output().text().append(line).append(1, '\n');
    output().flushWhenLarge();
}

void ChangeLines::markPersonal() {
    if (isPersonal_) {
        rows_.addFlag("personal", true);
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
        write("name", {{"name", change.after->get(treeSchema::information::nameKey)}});
    } else if (address == ProjectManagerBase::getDescriptionNodePath() && change.after) {
        write("description", {{"description", change.after->get(treeSchema::information::descriptionKey)}});
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
    if (isPersonal_) {
        writeLabelsOfFile(change, path);
        return;
    }
    if (!change.after) {
        write("remove", {{"path", path}});
        return;
    }
    if (!change.before) {
        write("add", {{"path", path}});
    }
    writeLabelsOfFile(change, path);
}

void ChangeLines::writeLabelsOfFile(Difference const& change, std::u16string const& path) {
    auto const before = labelsOf(change.before);
    auto const after = labelsOf(change.after);
    auto const writeLabel = [&](std::string_view word, LabelOnFile const& label) {
        auto const category = categoryAddress(label.first);
        auto const own = category.child(PathElement(treeSchema::categories::labelType, label.second));
        write(word, {{"category", nameAt(category)}, {"label", nameAt(own)}, {"path", path}});
    };
    for (auto const& label : without(before, after)) {
        writeLabel("take", label);
    }
    for (auto const& label : without(after, before)) {
        writeLabel("put", label);
    }
    if (change.before && before == after && !isPersonal_) {
        write("change", {{"path", path}});
    }
}

/// Data that belongs to a file whose own node has changed needs no line.
void ChangeLines::writeDataOfFile(Difference const& change) {
    bool const isInList = change.address[0].getLocation() == treeSchema::files::fileListScope;
    if (change.address.leaf().getType() == treeSchema::files::markerType && isPersonal_) {
        return;
    }
    if (isOfRemovedFile(change.address) || (isInList && find(change.address.parent()) != nullptr)) {
        return;
    }
    isInList ? write("change", {{"path", pathOf(change.address)}}) : writeOther(change);
}

void ChangeLines::writeNamed(std::string_view kind, Difference const& change, std::u16string const& owner) {
    constexpr auto const* key = treeSchema::categories::categoryNameKey;
    static_assert(std::u16string_view(key) == treeSchema::categories::labelNameKey);
    static_assert(std::u16string_view(key) == treeSchema::entrypoints::groupNameKey);
    std::vector<Member> members;
    if (!owner.empty()) {
        members.push_back({"category", owner});
    }
    members.push_back({"name", earliest(change, key)});
    auto const* word = !change.before ? " create" : !change.after ? " delete" : " rename";
    if (change.before && change.after) {
        members.push_back({"newName", change.after->get(key)});
    }
    write(std::string(kind) + word, members);
}

void ChangeLines::writeReference(std::string_view kind, Difference const& change) {
    write(std::string(kind) + (change.after ? " add" : " remove"),
          {{"folder", earliest(change, treeSchema::references::storedPathKey)}});
}

void ChangeLines::writeEntry(Difference const& change) {
    write(change.after ? "entry set" : "entry remove",
          {{"path", earliest(change, treeSchema::entrypoints::fileKey)}});
}

void ChangeLines::writeOther(Difference const& change) {
    std::vector<std::u16string> steps;
    for (auto const& step : change.address.getPath()) {
        steps.push_back(step.getType());
        steps.push_back(step.getLocation());
    }
    if (isJson_) {
        rows_.begin();
        rows_.addText("change", u"other");
        rows_.addList("address", steps);
        markPersonal();
        return;
    }
    output().text() += isPersonal_ ? "personal other" : "other";
    for (auto const& step : steps) {
        output().text() += ' ' + quotedName(step);
    }
    output().text() += '\n';
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
    std::shared_ptr<project::metadata::MetadataNode const> node =
        isPersonal_ ? project_.access().personalStore().getNode(address) : project_.store().getNode(address);
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

#include "comparison/ChangeList.hpp"

#include <algorithm>

#include "moves/FileList.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::stores {

namespace {

namespace schema = metadata::schema;

using Kind = DefinitionChange::Kind;
using Values = std::map<std::u16string, std::u16string>;

Kind kindOf(Difference const& difference) {
    return !difference.before ? Kind::Added : !difference.after ? Kind::Removed : Kind::Changed;
}

std::u16string valueOf(Node const& node, char16_t const* key) {
    return node ? node->get(key) : std::u16string();
}

/// The keys of a node, and the values that are nested in it by name, such as the extension data of an entry
/// point.
Values settingsOf(Node const& node) {
    Values result;
    if (node) {
        for (auto const& key : node->getKeys()) {
            result[key] = node->get(key);
        }
        for (auto const& nested : node->getChildren()) {
            auto const& name = nested->get(schema::entrypoints::extensionNameKey);
            result[name.empty() ? nested->get(schema::files::recordUUIDKey) : name] =
                nested->get(schema::entrypoints::extensionValueKey);
        }
    }
    return result;
}

std::u16string valueIn(Values const& values, std::u16string const& key) {
    auto const found = values.find(key);
    return found == values.end() ? std::u16string() : found->second;
}

Address underRoot(char16_t const* type, char16_t const* childType, std::u16string const& uuid) {
    return Address::root().child({type, schema::rootLocation}).child({childType, uuid});
}

Address categoryAddress(std::u16string const& uuid) {
    return underRoot(schema::categories::categoriesType, schema::categories::categoryType, uuid);
}

} // namespace

void ChangeList::add(Difference const& difference) {
    auto const& address = difference.address;
    auto const& head = address[0].getType();
    auto const depth = address.depth();
    if (!difference.before && !difference.after) {
        return; // an address was created without a node
    }
    if (head == schema::files::filesType && depth > 1) {
        addInFiles(difference);
    } else if (head == schema::categories::categoriesType && depth == 2) {
        addNamed(Subject::Category, difference, schema::categories::categoryNameKey);
    } else if (head == schema::categories::categoriesType && depth == 3) {
        if (!isOfRemovedCategory(address)) {
            addNamed(Subject::Label, difference, schema::categories::labelNameKey);
        }
    } else if (head == schema::entrypoints::groupsType && depth == 2) {
        addNamed(Subject::Group, difference, schema::entrypoints::groupNameKey);
    } else if (head == schema::entrypoints::entryPointsType && depth == 2) {
        addNamed(Subject::EntryPoint, difference, schema::entrypoints::fileKey);
    } else if (head == schema::references::projectPathType && depth == 2) {
        addNamed(Subject::ProjectPath, difference, schema::references::storedPathKey);
    } else if (head == schema::references::referencesType && depth == 2) {
        addNamed(Subject::Reference, difference, schema::references::storedPathKey);
    } else if (head == schema::information::nameType && depth == 1) {
        addSetting(Subject::Name, difference, schema::information::nameKey);
    } else if (head == schema::information::extensionsType && depth == 2) {
        addSetting(Subject::Description, difference, schema::information::descriptionKey);
    } else {
        addOther(difference);
    }
}

std::vector<DefinitionChange> ChangeList::take() && {
    std::ranges::stable_sort(changes_, {}, &DefinitionChange::subject);
    return std::move(changes_);
}

void ChangeList::addSetting(Subject subject, Difference const& difference, char16_t const* key) {
    DefinitionChange change{subject, Kind::Changed};
    change.earlier = valueOf(difference.before, key);
    change.name = valueOf(difference.after, key);
    if (change.earlier != change.name) {
        change.values.push_back({key, change.earlier, change.name});
        add(std::move(change));
    }
}

void ChangeList::addInFiles(Difference const& difference) {
    auto const& address = difference.address;
    auto const path = pathInList(address);
    if (path.empty() || address.leaf().getType() != schema::files::fileType) {
        addFileData(difference);
    } else {
        addFile(difference, path);
    }
}

void ChangeList::addFile(Difference const& difference, std::u16string const& path) {
    auto const kind = kindOf(difference);
    if (kind != Kind::Changed) {
        DefinitionChange change{Subject::File, kind};
        change.name = path;
        auto const& version = kind == Kind::Added ? after_ : before_;
        change.isFolder = static_cast<bool>(version.at(markerInList(path)));
        add(std::move(change));
    }
    if (kind != Kind::Removed) {
        addFileLabels(difference, path);
    }
}

void ChangeList::addFileLabels(Difference const& difference, std::u16string const& path) {
    auto const before = labelsOf(difference.before);
    auto const after = labelsOf(difference.after);
    auto const addLabel = [&](LabelValues::value_type const& label, Kind kind) {
        auto const category = categoryAddress(label.first.first);
        DefinitionChange change{Subject::FileLabel, kind};
        change.name = path;
        change.category = nameAt(category, schema::categories::categoryNameKey);
        change.label = nameAt(category.child({schema::categories::labelType, label.first.second}),
                              schema::categories::labelNameKey);
        auto const earlier = before.find(label.first);
        auto const value = earlier == before.end() ? std::u16string() : earlier->second;
        if (kind != Kind::Removed && value != label.second) {
            change.values.push_back({schema::files::labelValueKey, value, label.second});
        }
        add(std::move(change));
    };
    for (auto const& label : before) {
        if (!after.contains(label.first)) {
            addLabel(label, Kind::Removed);
        }
    }
    for (auto const& label : after) {
        auto const earlier = before.find(label.first);
        if (earlier == before.end()) {
            addLabel(label, Kind::Added);
        } else if (earlier->second != label.second) {
            addLabel(label, Kind::Changed);
        }
    }
    if (before == after && difference.before && difference.after) {
        addFileData(difference);
    }
}

void ChangeList::addFileData(Difference const& difference) {
    auto const& address = difference.address;
    DefinitionChange change{Subject::FileData, kindOf(difference)};
    std::size_t step = 1;
    for (; step < address.depth() && address[step].getType() == schema::files::fileType; ++step) {
        change.name += (change.name.empty() ? u"" : u"/") + address[step].getLocation();
    }
    if (change.name.empty()) {
        return addOther(difference);
    }
    auto const file = addressInList(change.name);
    bool const isOfRemoved = before_.at(file).node && !after_.at(file).node;
    bool const isOfAdded = !before_.at(file).node && after_.at(file).node;
    bool const isMarker = address == file.child({schema::files::markerType, schema::files::markerLocation});
    if (isOfRemoved || (isOfAdded && isMarker)) {
        return;
    }
    auto const& scope = address[0].getLocation();
    change.category = scope == schema::files::fileListScope ? std::u16string() : scope;
    for (; step < address.depth(); ++step) {
        change.category += (change.category.empty() ? u"" : u" ") + address[step].getType() + u' ' +
                           address[step].getLocation();
    }
    if (address != file) { // the node of a file has labels, which are changes of their own
        change.values = valuesOf(difference, u"");
    }
    add(std::move(change));
}

void ChangeList::addNamed(Subject subject, Difference const& difference, char16_t const* nameKey) {
    DefinitionChange change{subject, kindOf(difference)};
    auto const before = valueOf(difference.before, nameKey);
    auto const after = valueOf(difference.after, nameKey);
    change.name = difference.after ? after : before;
    if (change.name.empty()) {
        change.name = difference.address.leaf().getLocation();
    }
    if (subject == Subject::Label) {
        change.category = nameAt(difference.address.parent(), schema::categories::categoryNameKey);
    }
    if (change.kind != Kind::Removed) {
        change.values = valuesOf(difference, nameKey);
    }
    if (change.kind == Kind::Changed && before != after) {
        change.kind = Kind::Renamed;
        change.earlier = before;
    }
    add(std::move(change));
}

void ChangeList::addOther(Difference const& difference) {
    DefinitionChange change{Subject::Other, kindOf(difference)};
    for (auto const& step : difference.address.getPath()) {
        change.name += (change.name.empty() ? u"" : u" ") + step.getType() + u' ' + step.getLocation();
    }
    add(std::move(change));
}

bool ChangeList::isOfRemovedCategory(Address const& label) const {
    return !after_.at(label).node && !after_.at(label.parent()).node;
}

ChangeList::LabelValues ChangeList::labelsOf(Node const& node) {
    LabelValues result;
    if (node) {
        for (auto const& category : node->getChildren()) {
            for (auto const& label : category->getChildren()) {
                result.try_emplace(
                    {category->get(schema::files::categoryUUIDKey), label->get(schema::files::labelUUIDKey)},
                    label->get(schema::files::labelValueKey));
            }
        }
    }
    return result;
}

std::vector<DefinitionChange::Value> ChangeList::valuesOf(Difference const& difference,
                                                          char16_t const* except) const {
    auto const before = settingsOf(difference.before);
    auto const after = settingsOf(difference.after);
    auto const shown = [&](std::u16string const& key, std::u16string value) {
        bool const isGroup = key == schema::entrypoints::groupUUIDKey && !value.empty();
        return isGroup
                   ? nameAt(underRoot(schema::entrypoints::groupsType, schema::entrypoints::groupType, value),
                            schema::entrypoints::groupNameKey)
                   : value;
    };
    auto both = before;
    both.insert(after.begin(), after.end());
    std::vector<DefinitionChange::Value> result;
    for (auto const& [key, value] : both) {
        auto const earlier = valueIn(before, key);
        auto const later = valueIn(after, key);
        if (key != except && earlier != later) {
            result.push_back({key, shown(key, earlier), shown(key, later)});
        }
    }
    return result;
}

std::u16string ChangeList::nameAt(Address const& address, char16_t const* key) const {
    auto name = valueOf(after_.at(address).node, key);
    if (name.empty()) {
        name = valueOf(before_.at(address).node, key);
    }
    return name.empty() ? address.leaf().getLocation() : name;
}

} // namespace project::stores

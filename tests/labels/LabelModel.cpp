#include "labels/LabelModel.hpp"

#include <algorithm>
#include <set>

namespace project::test {

using management::LabelReadOnlyState;

namespace {

bool isBelow(Path const& path, Path const& folder) {
    return path.native().starts_with(folder.native() + u"/");
}

Path parentOf(Path const& path) {
    return path.native().substr(0, path.native().rfind(u'/'));
}

template <class Entries>
auto findUUID(Entries& entries, std::u16string const& uuid) {
    return std::find_if(entries.begin(), entries.end(),
                        [&](auto const& entry) { return entry.uuid == uuid; });
}

} // namespace

void LabelModel::add(Paths const& paths) {
    std::set<Path> all;
    for (auto path : paths) {
        for (; path != root_; path = parentOf(path)) {
            all.insert(path);
        }
    }
    for (auto const& path : all) {
        if (files_.contains(path)) {
            continue;
        }
        if (isInStore(path)) {
            throw Refusal{"FileIsMetadataError", {path.native()}};
        }
        if (std::find(onDisk_.begin(), onDisk_.end(), path) == onDisk_.end()) {
            throw Refusal{"FileDoesNotExistError", {path.native()}};
        }
    }
    for (auto const& path : all) {
        files_[path].categories.clear(); // the records are in another node and stay
    }
}

LabelModel::Paths LabelModel::remove(Paths const& paths) {
    std::set<Path> all(paths.begin(), paths.end());
    for (auto const& file : getProjectFiles()) {
        if (std::any_of(paths.begin(), paths.end(), [&](Path const& path) { return isBelow(file, path); })) {
            all.insert(file);
        }
    }
    for (auto const& path : all) {
        if (path == root_) {
            throw Refusal{"RootFolderNotRemoveable", {path.native()}};
        }
        requireFile(path);
    }
    for (auto const& path : all) {
        files_.erase(path);
    }
    return {all.begin(), all.end()};
}

LabelModel::Paths LabelModel::getProjectFiles() const {
    Paths result;
    for (auto const& [path, file] : files_) {
        result.push_back(path);
    }
    return result;
}

std::vector<LabelModel::FileLabel> LabelModel::addLabels(Paths const& paths,
                                                         std::vector<Label> const& labels) {
    std::vector<FileLabel> displaced;
    auto changed = files_;
    for (auto const& path : paths) {
        if (path != root_ && !files_.contains(path)) {
            continue;
        }
        auto file = requireFile(path);
        auto const pairs = getLabelIDSets(path);
        for (auto const& label : labels) {
            LabelIDSet const exchanged(label.getUUID(), label.getCategory().getUUID());
            if (std::find(pairs.begin(), pairs.end(), exchanged) == pairs.end()) {
                put(file, label, path, displaced);
            }
        }
        changed[path] = file;
    }
    files_ = changed;
    return displaced;
}

void LabelModel::put(File& file, Label const& label, Path const& path,
                     std::vector<FileLabel>& displaced) const {
    auto const& category = label.getCategory();
    auto found = findUUID(file.categories, category.getUUID());
    if (found == file.categories.end()) {
        found = file.categories.insert(found, {category.getUUID(), {}});
    } else if (category.isSingleValued()) {
        for (auto const& stored : found->labels) {
            try {
                displaced.emplace_back(category, getLabelByUUID(category, stored.labelUUID), path,
                                       stored.value);
            } catch (Refusal const&) {
                // removed without being returned
            }
        }
        found->labels.clear();
    }
    found->labels.push_back({label.getUUID(), u""});
}

void LabelModel::removeLabels(Paths const& paths, std::vector<Label> const& labels) {
    auto changed = files_;
    for (auto const& path : paths) {
        auto file = requireFile(path);
        for (auto const& label : labels) {
            auto const category = findUUID(file.categories, label.getCategory().getUUID());
            if (category == file.categories.end()) {
                continue;
            }
            auto const hasUUID = [&](StoredLabel const& stored) {
                return stored.labelUUID == label.getUUID();
            };
            auto const stored = std::find_if(category->labels.begin(), category->labels.end(), hasUUID);
            if (stored == category->labels.end()) {
                continue;
            }
            category->labels.erase(stored);
            std::erase_if(file.records, hasUUID);
            std::erase_if(file.categories, [](StoredCategory const& each) { return each.labels.empty(); });
        }
        changed[path] = file;
    }
    files_ = changed;
}

void LabelModel::removeCategory(Paths const& paths, CategoryIdentifier const& category) {
    for (auto const& path : paths) {
        requireFile(path);
    }
    for (auto const& path : paths) {
        std::erase_if(files_[path].categories,
                      [&](StoredCategory const& each) { return each.uuid == category.getUUID(); });
    }
}

std::vector<LabelModel::LabelIDSet> LabelModel::getLabelIDSets(Path const& path) const {
    std::vector<LabelIDSet> result;
    for (auto const& category : requireFile(path).categories) {
        for (auto const& stored : category.labels) {
            result.emplace_back(category.uuid, stored.labelUUID);
        }
    }
    return result;
}

std::vector<LabelModel::FileLabel> LabelModel::getLabels(Path const& path) const {
    std::vector<FileLabel> result;
    auto const& records = requireFile(path).records;
    for (auto const& pair : getLabelIDSets(path)) {
        auto const category = getCategoryByUUID(pair.getCategoryUUID());
        auto const label = getLabelByUUID(category, pair.getLabelUUID());
        auto const record = std::find_if(records.begin(), records.end(), [&](StoredLabel const& each) {
            return each.labelUUID == pair.getLabelUUID();
        });
        if (record != records.end()) {
            result.emplace_back(category, label, path, record->value);
        }
        result.emplace_back(category, label, path);
    }
    return result;
}

void LabelModel::createCategory(CategoryIdentifier const& category) {
    for (auto const& [uuid, other] : categories_) {
        if (other.definition.getName() == category.getName()) {
            throw Refusal{"CategoryExistsByName", {category.getName()}};
        }
    }
    auto const place = categories_.try_emplace(category.getUUID(), Category{category, {}}).first;
    place->second.definition = category;
}

void LabelModel::renameCategory(CategoryIdentifier const& category, std::u16string const& name) {
    if (category.isReadOnly()) {
        throw Refusal{"CanNotModifyReadOnlyCategory", {}};
    }
    auto const found = categories_.find(category.getUUID());
    if (found != categories_.end()) {
        auto& definition = found->second.definition;
        definition = CategoryIdentifier(definition.getUUID(), name, definition.isReadOnly(),
                                        definition.isSingleValued(), definition.getDataType());
    }
}

void LabelModel::deleteCategory(CategoryIdentifier const& category) {
    if (category.isReadOnly()) {
        throw Refusal{"CanNotModifyReadOnlyCategory", {}};
    }
    removeCategory(getProjectFiles(), category);
    categories_.erase(category.getUUID());
}

std::vector<LabelModel::CategoryIdentifier> LabelModel::getAllCategories() const {
    std::vector<CategoryIdentifier> result;
    for (auto const& [uuid, category] : categories_) {
        result.push_back(category.definition);
    }
    return result;
}

LabelModel::CategoryIdentifier LabelModel::getCategoryByUUID(std::u16string const& uuid) const {
    auto const found = categories_.find(uuid);
    if (found == categories_.end()) {
        throw Refusal{"CategoryDoesNotExistsByUUID", {uuid}};
    }
    return found->second.definition;
}

void LabelModel::createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    for (auto const& other : getLabels(category)) {
        if (other.getName() == label.getName()) {
            throw Refusal{"LabelExistsByName", {category.getName(), label.getName()}};
        }
    }
    categories_.at(category.getUUID()).labels.insert_or_assign(label.getUUID(), label);
}

void LabelModel::deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    auto const state = label.isReadOnly();
    if (state == LabelReadOnlyState::READ_ONLY ||
        (state == LabelReadOnlyState::INHERITED && category.isReadOnly())) {
        throw Refusal{"CanNotModifyReadOnlyLabel", {}};
    }
    removeLabels(getProjectFiles(), {Label(category, label)});
    auto const found = categories_.find(category.getUUID());
    if (found != categories_.end()) {
        found->second.labels.erase(label.getUUID());
    }
}

std::vector<LabelModel::LabelIdentifier> LabelModel::getLabels(CategoryIdentifier const& category) const {
    std::vector<LabelIdentifier> result;
    for (auto const& [uuid, label] : requireCategory(category).labels) {
        result.push_back(label);
    }
    return result;
}

LabelModel::LabelIdentifier LabelModel::getLabelByUUID(CategoryIdentifier const& category,
                                                       std::u16string const& uuid) const {
    auto const& labels = requireCategory(category).labels;
    auto const found = labels.find(uuid);
    if (found == labels.end()) {
        throw Refusal{"LabelDoesNotExistsByUUID", {uuid}};
    }
    return found->second;
}

void LabelModel::putRecord(Path const& path, std::u16string const& labelUUID, std::u16string const& value) {
    files_.at(path).records.push_back({labelUUID, value});
}

Lines LabelModel::records(Path const& path) const {
    Lines result;
    auto const file = files_.find(path);
    if (file != files_.end()) {
        for (auto const& record : file->second.records) {
            result.push_back(quoted(record.labelUUID) + " " + quoted(record.value));
        }
    }
    return result;
}

void LabelModel::putValue(Path const& path, std::u16string const& value) {
    files_.at(path).categories.at(0).labels.at(0).value = value;
}

LabelModel::File const& LabelModel::requireFile(Path const& path) const {
    auto const found = files_.find(path);
    if (found == files_.end()) {
        throw Refusal{"FileNotInProject", {path.native()}};
    }
    return found->second;
}

LabelModel::Category const& LabelModel::requireCategory(CategoryIdentifier const& category) const {
    auto const found = categories_.find(category.getUUID());
    if (found == categories_.end()) {
        throw Refusal{"CategoryDoesNotExist", {category.getName()}};
    }
    return found->second;
}

bool LabelModel::isInStore(Path const& path) const {
    return path == metadataRoot_ || isBelow(path, metadataRoot_);
}

} // namespace project::test

#include "exchange/ItemImport.hpp"

#include <algorithm>
#include <memory>

#include "exchange/LabelData.hpp"
#include "files/Additions.hpp"
#include "files/DiskFolder.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/labels/LabelDataValidators.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

using project::management::CategoryDefinition;
using project::management::CategoryIdentifier;
using project::management::LabelDefinition;
using project::management::LabelIDSet;

namespace {

bool isWithin(Path const& path, Path const& folder) {
    return path == folder || project::metadata::isParent(path, folder);
}

/// Whether the data is valid for a category. Data of a type that no validator knows is.
bool isValidData(CategoryIdentifier const& category, std::u16string const& data) {
    auto const validator = project::management::LabelDataValidators().getValidator(
        [&category](auto& each) { return each.getDataType() == category.getDataType(); });
    return !validator || validator->isValid(data);
}

/// The only thing of a list that has a name; the end if there is none.
template <typename Things>
auto onlyNamed(Things const& things, std::u16string const& name, char const* several) {
    auto const hasName = [&name](auto const& thing) { return thing.getName() == name; };
    if (std::ranges::count_if(things, hasName) > 1) {
        throw Failure(Message(several, name));
    }
    return std::ranges::find_if(things, hasName);
}

} // namespace

ItemImport::ItemImport(OpenProject& project, ImportedItems const& items, Unmapped& unmapped)
    : project_(project), items_(items), unmapped_(unmapped) {
}

void ItemImport::run() {
    addFiles();
    readLabels();
    put();
    writeData();
}

void ItemImport::addFiles() {
    std::vector<Path> added;
    for (auto const& item : items_) {
        auto const [found, isNew] = problems_.try_emplace(item.path);
        if (isNew && !project_.files().isFileInProject(item.path)) {
            found->second = problemOf(item.path);
            if (!found->second) {
                added.push_back(item.path);
            }
        }
        if (found->second) {
            unmapped_.add(item.line, *found->second);
        }
    }
    project_.access().addBelowLabelledFolders(added);
    project_.stageReturnedLater(added);
    addedFiles_ = added.size();
}

/// The reason why a path cannot be added; empty if it can.
std::optional<Message> ItemImport::problemOf(Path const& path) const {
    auto const& root = project_.root();
    if (!project::metadata::isParent(path, root)) {
        return Message("PathOutside", shown(path));
    }
    std::u16string const relative = project::metadata::getRelativePath(root, path);
    if (relative.starts_with(u"..")) {
        return Message("PathWithDots", relative);
    }
    if (isWithin(path, project_.store().getMetadataRoot())) {
        return Message("PathOfStore", relative);
    }
    return isOnDisk(path) ? std::nullopt : std::optional(Message("PathMissing", relative));
}

void ItemImport::readLabels() {
    for (auto const& item : items_) {
        if (item.label && !item.label->data.empty()) {
            withData_.insert(item.label->category);
        }
    }
    for (auto const& item : items_) {
        if (item.label && !problems_.at(item.path)) {
            try {
                readLabel(item, *item.label);
            } catch (Failure const& problem) {
                unmapped_.add(item.line, problem);
            }
        }
    }
}

void ItemImport::readLabel(ImportedItem const& item, ImportedLabel const& wanted) {
    if (item.path == project_.root()) {
        throw Failure(Message("LabelOfRoot"));
    }
    auto const& category = categoryNamed(wanted.category);
    if (!wanted.data.empty() && !isValidData(category, wanted.data)) {
        throw Failure(Message("DataInvalid", wanted.data, category.getDataType(), category.getName()));
    }
    auto const& label = labelNamed(category, wanted.label);
    if (takes(item, label, wanted.data)) {
        auto const [place, isNew] = putOf_.try_emplace({category.getUUID(), label.getUUID()}, puts_.size());
        if (isNew) {
            puts_.push_back({label, {}});
        }
        puts_[place->second].files.insert(item.path);
    }
}

ItemImport::Category const& ItemImport::categoryNamed(std::u16string const& name) {
    auto found = categories_.find(name);
    if (found == categories_.end()) {
        auto& labels = project_.manager().getLabelManager();
        auto const present = labels.getAllCategories();
        auto const stored = onlyNamed(present, name, "ImportSeveralCategories");
        if (stored != present.end()) {
            return categories_.emplace(name, *stored).first->second;
        }
        CategoryDefinition category(name);
        if (withData_.contains(name)) {
            category.setDataType(project::management::StringDataValidator().getDataType());
        }
        labels.createCategory(category);
        found = categories_.emplace(name, category).first;
    }
    return found->second;
}

ItemImport::Label const& ItemImport::labelNamed(Category const& category, std::u16string const& name) {
    Key const key(category.getUUID(), name);
    auto found = labels_.find(key);
    if (found == labels_.end()) {
        auto& labels = project_.manager().getLabelManager();
        auto const present = labels.getLabels(category);
        auto const stored = onlyNamed(present, name, "ImportSeveralLabels");
        if (stored != present.end()) {
            return labels_.emplace(key, Label(category, *stored)).first->second;
        }
        LabelDefinition const label(name);
        labels.createLabel(category, label);
        found = labels_.emplace(key, Label(category, label)).first;
    }
    return found->second;
}

/// Whether the label is not yet on its file. Notes its data. @throws Failure if an earlier item contradicts
/// it.
bool ItemImport::takes(ImportedItem const& item, Label const& label, std::u16string const& data) {
    auto const& category = label.getCategory();
    if (category.isSingleValued()) {
        auto const [found, isNew] = single_.try_emplace({item.path, category.getUUID()}, label.getUUID());
        if (found->second != label.getUUID()) {
            throw Failure(Message("LabelContradicts", category.getName()));
        }
    }
    if (!data.empty()) {
        Key const key(category.getUUID(), label.getUUID());
        if (data_.try_emplace({item.path, key}, data).first->second != data) {
            throw Failure(Message("DataContradicts"));
        }
    }
    auto const present = project_.files().getLabelIDSets(item.path);
    return std::ranges::count(present, LabelIDSet(category, label.getLabelIdentifier())) == 0;
}

void ItemImport::put() {
    for (auto const& put : puts_) {
        project_.files().addLabels({put.files.begin(), put.files.end()}, {put.label});
        putLabels_ += put.files.size();
    }
}

void ItemImport::writeData() {
    LabelData stored(project_);
    for (auto const& [place, data] : data_) {
        stored.set(place.first, place.second.second, data);
    }
    stored.write();
}

} // namespace projectctl

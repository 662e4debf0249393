#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/labels/Label.hpp"

namespace project::test {

using fl::filesystem::Path;

/// The result of an operation, one line for each item, or its error.
using Lines = std::vector<std::string>;

inline std::string quoted(std::u16string const& text) {
    return '"' + fl::i18n::toUtf8(text) + '"';
}

inline std::string line(management::CategoryIdentifier const& category) {
    return quoted(category.getUUID()) + " " + quoted(category.getName()) +
           (category.isReadOnly() ? " read-only" : "") + (category.isSingleValued() ? " single-valued" : "") +
           " of " + quoted(category.getDataType());
}

inline std::string line(management::LabelIdentifier const& label) {
    return quoted(label.getUUID()) + " " + quoted(label.getName()) + " " +
           fl::i18n::toUtf8(labelTypeToString(label.isReadOnly()));
}

inline std::string line(management::FileLabel const& label) {
    return line(label.getCategory()) + ": " + line(label.getLabelIdentifier()) + " on " +
           quoted(label.getFile().native()) + " with " + quoted(label.getData());
}

inline std::string line(management::LabelIDSet const& pair) {
    return quoted(pair.getCategoryUUID()) + ": " + quoted(pair.getLabelUUID());
}

inline std::string line(Path const& path) {
    return quoted(path.native());
}

template <class Item>
Lines lines(std::vector<Item> const& items) {
    Lines result;
    for (auto const& item : items) {
        result.push_back(line(item));
    }
    return result;
}

/// Thrown by the model where the managers throw an error of the catalog.
struct Refusal {
    std::string message;
    std::vector<std::u16string> arguments;
};

inline Lines lines(Refusal const& refusal) {
    Lines result{"raises " + refusal.message};
    for (auto const& argument : refusal.arguments) {
        result.push_back(quoted(argument));
    }
    return result;
}

/// A project's files, categories and labels in plain containers, with which the managers are compared. Its
/// operations have the names of theirs. An operation that throws a Refusal has changed nothing.
class LabelModel {
public:
    using CategoryIdentifier = management::CategoryIdentifier;
    using Label = management::Label;
    using LabelIdentifier = management::LabelIdentifier;
    using FileLabel = management::FileLabel;
    using LabelIDSet = management::LabelIDSet;
    using Paths = std::vector<Path>;

    /// @param onDisk all files and folders on disk below the root, except the store's.
    LabelModel(Path root, Path metadataRoot, Paths onDisk)
        : root_(std::move(root)), metadataRoot_(std::move(metadataRoot)), onDisk_(std::move(onDisk)) {}

    void add(Paths const& paths);
    Paths remove(Paths const& paths);
    Paths getProjectFiles() const;

    std::vector<FileLabel> addLabels(Paths const& paths, std::vector<Label> const& labels);
    void removeLabels(Paths const& paths, std::vector<Label> const& labels);
    void removeCategory(Paths const& paths, CategoryIdentifier const& category);
    std::vector<LabelIDSet> getLabelIDSets(Path const& path) const;
    std::vector<FileLabel> getLabels(Path const& path) const;

    void createCategory(CategoryIdentifier const& category);
    void renameCategory(CategoryIdentifier const& category, std::u16string const& name);
    void deleteCategory(CategoryIdentifier const& category);
    std::vector<CategoryIdentifier> getAllCategories() const;
    CategoryIdentifier getCategoryByUUID(std::u16string const& uuid) const;
    void createLabel(CategoryIdentifier const& category, LabelIdentifier const& label);
    void deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label);
    std::vector<LabelIdentifier> getLabels(CategoryIdentifier const& category) const;
    LabelIdentifier getLabelByUUID(CategoryIdentifier const& category, std::u16string const& uuid) const;

    /// Adds a data record to a file, as another program would.
    void putRecord(Path const& path, std::u16string const& labelUUID, std::u16string const& value);

    /// Returns the data records of a file, the UUID of the label and the data of each.
    Lines records(Path const& path) const;

    /// Sets a value of the first label of a file, as another program would.
    void putValue(Path const& path, std::u16string const& value);

private:
    struct StoredLabel {
        std::u16string labelUUID;
        std::u16string value;
    };

    struct StoredCategory {
        std::u16string uuid;
        std::vector<StoredLabel> labels;
    };

    struct File {
        std::vector<StoredCategory> categories;
        std::vector<StoredLabel> records;
    };

    struct Category {
        CategoryIdentifier definition;
        std::map<std::u16string, LabelIdentifier> labels;
    };

    File const& requireFile(Path const& path) const;
    Category const& requireCategory(CategoryIdentifier const& category) const;
    bool isInStore(Path const& path) const;
    void put(File& file, Label const& label, Path const& path, std::vector<FileLabel>& displaced) const;

    Path root_;
    Path metadataRoot_;
    Paths onDisk_;
    std::map<Path, File> files_;
    std::map<std::u16string, Category> categories_;
};

} // namespace project::test

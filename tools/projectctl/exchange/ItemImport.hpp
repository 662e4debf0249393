#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "exchange/ImportedItem.hpp"
#include "exchange/Unmapped.hpp"
#include "project/OpenProject.hpp"
#include "project/labels/Label.hpp"
#include "texts/Message.hpp"

namespace projectctl {

/// Brings items into a project: adds the files that are not in it, creates categories and labels that do not
/// exist, and puts labels with their data on files. It removes nothing, except that a label of a
/// single-valued category replaces the one that the file has. Items that the project has already change
/// nothing.
///
/// Use it once, in a transaction.
class ItemImport {
public:
    /// @param unmapped gets the items that the project cannot have. Both are borrowed.
    ItemImport(OpenProject& project, ImportedItems const& items, Unmapped& unmapped);

    void run();

    std::size_t addedFiles() const noexcept { return addedFiles_; }

    std::size_t putLabels() const noexcept { return putLabels_; }

private:
    using Label = project::management::Label;
    using Category = project::management::CategoryIdentifier;
    using Key = std::pair<std::u16string, std::u16string>; ///< two names or two UUIDs

    /// The files that get a label.
    struct Put {
        Label label;
        std::set<Path> files;
    };

    void addFiles();
    std::optional<Message> problemOf(Path const& path) const;
    void readLabels();
    void readLabel(ImportedItem const& item, ImportedLabel const& wanted);
    Category const& categoryNamed(std::u16string const& name);
    Label const& labelNamed(Category const& category, std::u16string const& name);
    bool takes(ImportedItem const& item, Label const& label, std::u16string const& data);
    void put();
    void writeData();

    OpenProject& project_;
    ImportedItems const& items_;
    Unmapped& unmapped_;
    std::map<Path, std::optional<Message>> problems_; ///< of the paths of all items; empty for none
    std::set<std::u16string> withData_;               ///< names of the categories whose labels have data
    std::map<std::u16string, Category> categories_;   ///< by name
    std::map<Key, Label> labels_;                     ///< by the category's UUID and the name
    std::map<std::pair<Path, std::u16string>, std::u16string>
        single_;                                          ///< label of a file, by single-valued category
    std::map<std::pair<Path, Key>, std::u16string> data_; ///< by file and UUIDs of the label
    std::vector<Put> puts_;                               ///< in the order of the items
    std::map<Key, std::size_t> putOf_;                    ///< by UUIDs
    std::size_t addedFiles_ = 0;
    std::size_t putLabels_ = 0;
};

} // namespace projectctl

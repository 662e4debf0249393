#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Export.hpp"

namespace project::stores {

/// A change between two versions of a project's definition, in terms of the project instead of its text.
struct DefinitionChange {
    /// The part of the definition that has changed.
    enum class Subject {
        Name,        ///< of the project
        Description, ///< of the project
        File,        ///< a file or folder of the file list
        FileLabel,   ///< a label on a file or folder
        FileData,    ///< anything else that is stored for a file, at one address
        Category,
        Label, ///< of a category
        EntryPoint,
        Group,       ///< of entry points
        ProjectPath, ///< a folder on the project path
        Reference,   ///< to another project
        Other,       ///< an address that none of the others describes
    };

    /// How it has changed.
    enum class Kind { Added, Removed, Renamed, Changed };

    /// One setting, by its key in the tree; for a group, its name instead of its UUID. An empty value and an
    /// absent one are alike.
    struct Value {
        std::u16string key;    ///< the name of the setting
        std::u16string before; ///< its earlier value
        std::u16string after;  ///< its later value

        friend bool operator==(Value const&, Value const&) = default;
    };

    Subject subject; ///< the part of the definition
    Kind kind;       ///< how it has changed

    /// The name or path: the later one, except of something that was removed. For a label on a file, its data
    /// and an entry point, the path of the file. Paths are relative to the project's root.
    std::u16string name = {};

    /// For Renamed: the earlier name or path.
    std::u16string earlier = {};

    /// For FileLabel and Label: the name of the category. For FileData: the steps of the address behind the
    /// file, and before it the scope, if it is not the file list.
    std::u16string category = {};

    /// For FileLabel: the name of the label.
    std::u16string label = {};

    /// For File: whether it is a folder.
    bool isFolder = false;

    /// For a renamed file or folder: whether it moved with a folder that was renamed as a whole.
    bool isWithFolder = false;

    /// The settings that changed, or that something new has.
    std::vector<Value> values = {};

    friend bool operator==(DefinitionChange const&, DefinitionChange const&) = default;
};

/// The changes between two texts, by subject, and for one subject in the order of the tree.
///
/// A file that was renamed is one change, and what was changed about it as well is compared with its earlier
/// state; entry points and the project path follow it silently. The labels of a removed file, and the labels
/// of a removed category, are not listed one by one.
///
/// @param before an empty text is a project without anything, as is after. Damaged lines are left out, and in
/// a
///        text with conflict markers both sides count.
/// @param renames the files that source control knows to be renamed: the earlier and the later paths. One is
///        followed if both texts agree with it.
/// @throws StoreError if a text is incomplete or of a later format. Its file is "before" or "after".
PROJECT_STORES_EXPORT std::vector<DefinitionChange>
changesBetween(std::string_view before, std::string_view after,
               std::map<std::u16string, std::u16string> const& renames = {});

} // namespace project::stores

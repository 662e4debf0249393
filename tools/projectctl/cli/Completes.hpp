#pragma once

#include <CLI/CLI.hpp>

namespace projectctl {

/// The things of which an argument, or the value of an option, is one. A shell offers them.
enum class Completes {
    Nothing,
    Categories,
    Labels,       ///< of the category that an earlier argument names
    LabelChoices, ///< a category, or one of its labels in the form CATEGORY=LABEL
    ProjectPaths, ///< files and folders of the project, one level at a time
    NewPaths,     ///< files on disk that are not in the project, and folders
    Files,        ///< files and folders on disk
    Kinds,        ///< of entries: file or folder
    ColorUses,    ///< auto, always or never
    Folders,      ///< folders on disk
    EntryPoints,  ///< files that are entry points
    EntryPointTypes,
    EntryPointGroups,
    DataTypes,   ///< of the data of labels
    PathFolders, ///< folders of the project path
    References,  ///< folders of the referenced projects
};

/// Declares the things that an argument or an option names. @return the option.
CLI::Option* completes(CLI::Option* option, Completes things);

/// The things that were declared for an argument or an option.
Completes completedBy(CLI::Option& option);

} // namespace projectctl

#pragma once

#include <string_view>

/// The stable names of all findings of `check` and `status`. The guide lists them, and programs rely on them.
namespace projectctl::code {

// Faults of the text, or of the log of a shared project.
inline constexpr std::string_view textDamaged = "text-damaged";
inline constexpr std::string_view textConflict = "text-conflict";
inline constexpr std::string_view textIrregular = "text-irregular";
inline constexpr std::string_view textTornTail = "text-torn-tail";
inline constexpr std::string_view textDisplaced = "text-displaced";

// Files.
inline constexpr std::string_view nameImpossible = "name-impossible";
inline constexpr std::string_view nameBackslash = "name-backslash";
inline constexpr std::string_view folderNotListed = "folder-not-listed";

// Labels.
inline constexpr std::string_view categoryMissing = "category-missing";
inline constexpr std::string_view labelMissing = "label-missing";
inline constexpr std::string_view labelRepeated = "label-repeated";
inline constexpr std::string_view labelsContradict = "labels-contradict";
inline constexpr std::string_view labelStateUnknown = "label-state-unknown";

// Entry points.
inline constexpr std::string_view entryTypeUnknown = "entry-type-unknown";
inline constexpr std::string_view entryFileNotListed = "entry-file-not-listed";
inline constexpr std::string_view entryFileGone = "entry-file-gone";
inline constexpr std::string_view entryRepeated = "entry-repeated";
inline constexpr std::string_view groupMissing = "group-missing";

// References.
inline constexpr std::string_view referenceTypeUnsupported = "reference-type-unsupported";
inline constexpr std::string_view referenceFolderMissing = "reference-folder-missing";
inline constexpr std::string_view referenceProjectMissing = "reference-project-missing";

// Folders that keep themselves up to date.
inline constexpr std::string_view syncNew = "sync-new";
inline constexpr std::string_view syncGone = "sync-gone";
inline constexpr std::string_view syncFolderMissing = "sync-folder-missing";
inline constexpr std::string_view syncFolderAbsent = "sync-folder-absent";

// Anything else in the definition.
inline constexpr std::string_view nodeMissing = "node-missing";
inline constexpr std::string_view dataUnused = "data-unused";

// The set-up of git.
inline constexpr std::string_view mergeNotAssigned = "merge-not-assigned";
inline constexpr std::string_view mergeNotSetUp = "merge-not-set-up";
inline constexpr std::string_view mergeOtherCommand = "merge-other-command";
inline constexpr std::string_view mergeProgramMissing = "merge-program-missing";

} // namespace projectctl::code

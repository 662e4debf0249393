#pragma once

#include <string_view>

namespace projectctl {

/// The form of a JSON document. docs/json/ contains a schema for each, by name.
///
/// A program that reads documents of one version can rely on it: when a member is removed or renamed or
/// changes its meaning, the version grows, and so does it when a member is added, because readers may be
/// strict.
struct JsonFormat {
    std::string_view name; ///< "projectctl-" and the words of the verb
    int version;
};

namespace json {

inline constexpr JsonFormat categoryList{"projectctl-category-list", 2};
inline constexpr JsonFormat check{"projectctl-check", 1};
inline constexpr JsonFormat description{"projectctl-description", 1};
inline constexpr JsonFormat diff{"projectctl-diff", 1};
inline constexpr JsonFormat done{"projectctl-done", 1}; ///< of verbs that only change the project
inline constexpr JsonFormat dryRun{"projectctl-dry-run", 2};
inline constexpr JsonFormat entryList{"projectctl-entry-list", 1}; ///< also of `entry show`
inline constexpr JsonFormat exportCodeOwners{"projectctl-export-codeowners", 1};
inline constexpr JsonFormat exportRows{"projectctl-export", 1}; ///< of `export csv` and `export jsonl`
inline constexpr JsonFormat groupList{"projectctl-group-list", 1};
inline constexpr JsonFormat help{"projectctl-help", 1};
inline constexpr JsonFormat imported{"projectctl-import", 1};
inline constexpr JsonFormat init{"projectctl-init", 1};
inline constexpr JsonFormat labelList{"projectctl-label-list", 2};
inline constexpr JsonFormat labelShow{"projectctl-label-show", 2};
inline constexpr JsonFormat list{"projectctl-list", 1}; ///< also of `label find` and `export files`
inline constexpr JsonFormat log{"projectctl-log", 1};
inline constexpr JsonFormat message{"projectctl-message", 1}; ///< on standard error
inline constexpr JsonFormat name{"projectctl-name", 1};
inline constexpr JsonFormat referenceGraph{"projectctl-reference-graph", 1};
inline constexpr JsonFormat referenceList{"projectctl-reference-list", 1}; ///< also of `path list`
inline constexpr JsonFormat report{"projectctl-report", 1};
inline constexpr JsonFormat resolve{"projectctl-resolve", 1};
inline constexpr JsonFormat root{"projectctl-root", 1};
inline constexpr JsonFormat sharedLog{"projectctl-shared-log", 1};
inline constexpr JsonFormat sharedRoles{"projectctl-shared-roles", 1};
inline constexpr JsonFormat sharedStatus{"projectctl-shared-status", 1};
inline constexpr JsonFormat sharedTidy{"projectctl-shared-tidy", 1};
inline constexpr JsonFormat status{"projectctl-status", 1};
inline constexpr JsonFormat statusRenames{"projectctl-status-renames", 1};
inline constexpr JsonFormat sync{"projectctl-sync", 1};
inline constexpr JsonFormat syncRules{"projectctl-sync-rules", 1}; ///< of `sync --rules`
inline constexpr JsonFormat version{"projectctl-version", 1};
inline constexpr JsonFormat watch{"projectctl-watch", 2}; ///< of the first line; the others are its events

} // namespace json

} // namespace projectctl

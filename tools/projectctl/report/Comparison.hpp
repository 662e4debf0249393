#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "git/CommitLog.hpp"
#include "history/GitProject.hpp"
#include "project/stores/DefinitionChange.hpp"
#include "report/Definition.hpp"

namespace projectctl {

/// The change of a file since a revision, in the order in which the page numbers them. A file that changed in
/// several ways has the first of Renamed, Labels and Content.
enum class FileChange : std::uint8_t { None, Added, Removed, Labels, Content, Renamed };

/// A file or folder of the definition now or in a revision.
struct ComparedEntry {
    Definition::Entry entry;
    FileChange change = FileChange::None;
    std::optional<LabelsOnFile> labelsBefore; ///< if they changed
    std::uint64_t sizeBefore = 0;             ///< of Removed
    std::u16string pathBefore;                ///< of Renamed
};

/// The differences between two definitions of a project.
struct Comparison {
    std::string revision; ///< as the caller named it
    LoggedCommit commit;
    std::vector<ComparedEntry> entries;                   ///< of both, in the order of `list`
    std::vector<project::stores::DefinitionChange> other; ///< those that are not about files and their labels
    std::map<std::u16string, Definition::Category>
        categoriesBefore; ///< for the names of labels that are gone
};

/// Compares the definition with that of a revision. Files that git knows to be renamed are followed, as by
/// `diff`.
/// @throws Failure if the revision does not exist, or has no definition of the project.
Comparison compareWith(std::string const& revision, GitProject const& project, Definition const& now);

} // namespace projectctl

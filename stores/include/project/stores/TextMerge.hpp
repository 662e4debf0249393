#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Export.hpp"
#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// Two versions of a project's text, merged with their common version: by address, by key, and by the
/// identity of nested nodes. docs/store/merging.md describes the rules. A change that one side made is taken,
/// a change that both made is taken once, and the rest are conflicts.
class PROJECT_STORES_EXPORT TextMerge {
public:
    TextMerge(TextMerge&&) noexcept;
    TextMerge& operator=(TextMerge&&) noexcept;
    ~TextMerge();

    /// What a person has to decide, by address; none when the merge is clean.
    std::vector<MergeConflict> const& conflicts() const noexcept;

    /// The merged text: a canonical body without a tail.
    /// @param choices whose version stands, one for each conflict in the order of conflicts().
    /// @throws std::invalid_argument when they are not as many as the conflicts.
    std::string text(std::vector<MergeSide> const& choices = {}) const;

    /// The merged text with markers around the lines of each address in conflict, first ours, then those of
    /// the common version, then theirs. Whatever is not in conflict is merged within them too. A store that
    /// reads it counts both sides and refuses to write. Without conflicts the same as text().
    std::string textWithMarkers() const;

private:
    class State;

    explicit TextMerge(std::unique_ptr<State const> state) noexcept;

    friend PROJECT_STORES_EXPORT TextMerge mergeTexts(std::string_view base, std::string_view ours,
                                                      std::string_view theirs);

    std::unique_ptr<State const> state_;
};

/// Merges what three texts say, each with its tail laid over its body; none has to be canonical.
///
/// Nested nodes come in the order in which both sides have them; where these differ in the order of the side
/// that moved them, and where both did in the one that comes first by identity. Those that only one side has
/// stay behind what they follow there; where both sides put some in one place, those come first whose
/// identity does. So exchanging ours and theirs gives the same text if there is no conflict.
///
/// Time and memory are in proportion to the texts. Reads and writes nothing on disk, takes no lock.
///
/// @param base the version that both come from; an empty text when both made the project.
/// @throws StoreError when one of the texts is incomplete, damaged, of a later format or holds the markers of
///         another merge. Its file is "base", "ours" or "theirs".
PROJECT_STORES_EXPORT TextMerge mergeTexts(std::string_view base, std::string_view ours,
                                           std::string_view theirs);

} // namespace project::stores

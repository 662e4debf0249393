#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Export.hpp"
#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// The files that one side of a merge renamed, as source control knows them. Paths are relative to the
/// project's root.
struct SideRenames {
    /// Paths by paths.
    using Paths = std::map<std::u16string, std::u16string>;

    Paths renamed; ///< the path in the common version, and the side's path

    /// The side's path of a file that the merge of the files puts elsewhere, and the path there. The other
    /// side renamed the folder of such a file.
    Paths relocated;
};

/// Two versions of a project's text, merged with their common version: by address, by key, and by the
/// identity of nested nodes. docs/store/merging.md describes the rules. A change that one side made is taken,
/// a change that both made is taken once, and the rest are conflicts.
class PROJECT_STORES_EXPORT TextMerge {
public:
    TextMerge(TextMerge&&) noexcept;
    TextMerge& operator=(TextMerge&&) noexcept;
    ~TextMerge();

    /// The conflicts that a person must resolve, sorted by address; none if the merge is clean.
    std::vector<MergeConflict> const& conflicts() const noexcept;

    /// The merged text: a canonical body without a tail.
    /// @param choices the side whose version wins, one for each conflict in the order of conflicts().
    /// @throws std::invalid_argument if their number is not that of the conflicts.
    std::string text(std::vector<MergeSide> const& choices = {}) const;

    /// The merged text with conflict markers around the lines of each address in conflict: first ours, then
    /// those of the common version, then theirs. Everything in these lines that is not in conflict is merged.
    /// A store that reads this text shows both sides and refuses writes. The same as text() if there are no
    /// conflicts.
    std::string textWithMarkers() const;

private:
    class State;

    explicit TextMerge(std::unique_ptr<State const> state) noexcept;

    friend PROJECT_STORES_EXPORT TextMerge mergeTexts(std::string_view base, std::string_view ours,
                                                      std::string_view theirs, SideRenames const& ourRenames,
                                                      SideRenames const& theirRenames);

    std::unique_ptr<State const> state_;
};

/// Merges the definitions in three texts, each with its tail applied to its body. The texts need not be
/// canonical.
///
/// Nested nodes keep the order that both sides have. If the orders differ, the order of the side that moved
/// nodes wins; if both moved them, the order that is smaller by identity. A node that only one side has stays
/// behind the node that it follows there; if both sides added nodes in one position, those with the smaller
/// identity come first. Exchanging ours and theirs therefore gives the same text if there is no conflict.
///
/// Time and memory are proportional to the texts. Accesses no disk and takes no lock.
///
/// @param base the common version; an empty text if both sides created the project. It may contain conflict
///        markers, if git merged it from several common versions: where these differ, the sides must agree.
/// @throws StoreError if one of the texts is incomplete, damaged or of a later format, or if a side contains
///         conflict markers of another merge. Its file is "base", "ours" or "theirs".
PROJECT_STORES_EXPORT TextMerge mergeTexts(std::string_view base, std::string_view ours,
                                           std::string_view theirs);

/// The same, following renames: a change that one side made to a file applies to the file that the other side
/// has renamed, at its new path. A rename is followed only where the text of its side agrees with it. Without
/// renames, the result is that of the other function.
PROJECT_STORES_EXPORT TextMerge mergeTexts(std::string_view base, std::string_view ours,
                                           std::string_view theirs, SideRenames const& ourRenames,
                                           SideRenames const& theirRenames);

} // namespace project::stores

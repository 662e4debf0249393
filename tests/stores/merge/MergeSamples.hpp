#pragma once

#include <string>
#include <vector>

#include "line/LineAddress.hpp"
#include "project/stores/TextMerge.hpp"
#include "support/ProjectTextSamples.hpp"
#include "text/ProjectText.hpp"

namespace project::stores::samples {

/// A canonical text in which these changes were made in turn.
inline std::string textWith(Batch const& batch) {
    return ProjectText::empty().rewrittenWith(batch).body();
}

inline std::string toAscii(std::u16string const& text) {
    std::string result;
    for (char16_t const unit : text) {
        result += static_cast<char>(unit);
    }
    return result;
}

/// A conflict as "Key Name at "a" in Category c/Label l, removed by ours" or "Subtree at "a", removed by
/// ours, changed "a/b"".
inline std::string described(MergeConflict const& conflict) {
    constexpr char const* kinds[] = {"Key", "Type", "Nested", "Subtree"};
    std::string result = kinds[static_cast<int>(conflict.kind)];
    result += conflict.key.empty() ? "" : " " + toAscii(conflict.key);
    result += " at " + std::string(AddressText(conflict.address).view().text);
    std::string before = " in ";
    for (NestedStep const& step : conflict.nested) {
        result += before + toAscii(step.type) + ' ' + toAscii(step.value);
        result += step.earlier == 0 ? "" : "#" + std::to_string(step.earlier);
        before = "/";
    }
    if (conflict.removedBy) {
        result += *conflict.removedBy == MergeSide::Ours ? ", removed by ours" : ", removed by theirs";
    }
    for (Address const& address : conflict.changed) {
        result += ", changed " + std::string(AddressText(address).view().text);
    }
    return result;
}

/// Conflicts, one per line.
inline std::string described(std::vector<MergeConflict> const& conflicts) {
    std::string result;
    for (MergeConflict const& conflict : conflicts) {
        result += result.empty() ? "" : "\n";
        result += described(conflict);
    }
    return result;
}

/// The merged text, or the conflicts if there are any.
inline std::string merged(std::string const& base, std::string const& ours, std::string const& theirs) {
    TextMerge const merge = mergeTexts(base, ours, theirs);
    return merge.conflicts().empty() ? merge.text() : described(merge.conflicts());
}

} // namespace project::stores::samples

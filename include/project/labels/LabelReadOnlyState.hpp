#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// Whether a label may be deleted.
enum class LabelReadOnlyState {
    READ_ONLY = 0,
    WRITABLE = 1,
    INHERITED = 2, ///< as the label's category; decided at the moment of a delete
};

/// The text by which the store holds a state: the name of the enumerator.
/// @throws std::out_of_range for a value that is none of the three.
PROJECT_MANAGEMENT_EXPORT std::u16string const& labelTypeToString(LabelReadOnlyState state);

/// The state for a text, compared by code units; INHERITED for the empty text, which is what a label that was
/// stored without a state reads as.
/// @throws LabelReadOnlyStateUndefined, nested over std::out_of_range, for any other text.
PROJECT_MANAGEMENT_EXPORT LabelReadOnlyState getLabelStateFromName(std::u16string const& text);

} // namespace project::management

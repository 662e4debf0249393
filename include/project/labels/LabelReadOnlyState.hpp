#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// Whether a label may be deleted.
enum class LabelReadOnlyState {
    READ_ONLY = 0,
    WRITABLE = 1,
    INHERITED = 2, ///< as the label's category, at the time of the deletion
};

/// Returns the text that is stored for a state, which is the name of the enumerator.
/// @throws std::out_of_range for any other value.
PROJECT_MANAGEMENT_EXPORT std::u16string const& labelTypeToString(LabelReadOnlyState state);

/// Returns the state for a text, compared by code units. The empty text, which a label without a stored state
/// has, gives INHERITED.
/// @throws LabelReadOnlyStateUndefined, nested over std::out_of_range, for any other text.
PROJECT_MANAGEMENT_EXPORT LabelReadOnlyState getLabelStateFromName(std::u16string const& text);

} // namespace project::management

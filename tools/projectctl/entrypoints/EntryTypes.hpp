#pragma once

#include <string>
#include <vector>

namespace projectctl {

/// The names of the types of entry points, as the tool shows them.
std::vector<std::u16string> entryTypeNames();

} // namespace projectctl

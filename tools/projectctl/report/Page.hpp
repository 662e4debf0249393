#pragma once

#include <string>
#include <string_view>

namespace projectctl {

/// The page with the data of a report. It contains everything that it needs. Its Content-Security-Policy
/// permits the scripts and the style of the page, by their checksums, and nothing else: no name of the
/// project can run, and nothing is loaded.
/// @param data JSON without "<".
std::string assemblePage(std::string_view data);

} // namespace projectctl

#pragma once

#include <map>
#include <string>
#include <string_view>

namespace projectctl {

/// The members of a JSON object whose values are texts, by name.
using JsonTexts = std::map<std::u16string, std::u16string>;

/// Reads an object on one line. An escaped surrogate may lack its partner: it represents a byte of a name
/// that is not valid UTF-8.
/// @throws Failure if the line is something else, or if two members have the same name.
JsonTexts readJsonLine(std::string_view line);

} // namespace projectctl

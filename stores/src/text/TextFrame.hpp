#pragma once

#include <string>
#include <string_view>

namespace project::stores {

/// The first line of every text, without its line end.
inline constexpr std::string_view firstLine = R"({"format":"project-definition","version":1})";

/// The last line of every body, without its line end.
inline constexpr std::string_view endLine = R"({"end":"project-definition"})";

/// Checks the first line of a text.
/// @param line without its end.
/// @param hasEnd false when the text ends with this line and without a line end.
/// @param file how to name the file in errors.
/// @return false when the text is only the beginning of a first line.
/// @throws StoreError when it is not a project's text at all or of a later format.
bool checkFirstLine(std::string_view line, bool hasEnd, std::string const& file);

} // namespace project::stores

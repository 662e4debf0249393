#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace projectctl {

/// The number of columns of help texts.
inline constexpr std::size_t helpWidth = 80;

/// Appends words in lines of at most helpWidth columns. A word that is longer than a line has a line of its
/// own.
/// @param column the column at which the output stands.
/// @param indent the column in which each further line begins.
void appendWrapped(std::string& out, std::string_view text, std::size_t column, std::size_t indent);

/// The number of columns of a text in UTF-8 without combining or wide characters.
std::size_t columnsOf(std::string_view text);

} // namespace projectctl

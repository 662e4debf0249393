#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace project::postgresql {

/// Cuts a body into pieces and compresses each on its own. A piece has at most 1 MiB, also if its content
/// cannot be compressed.
std::vector<std::string> cutBody(std::string_view body);

/// Appends the content of a piece to a body.
/// @return false if the piece is unreadable, or larger than cutBody makes them.
bool appendPiece(std::string& body, std::string_view piece);

} // namespace project::postgresql

#pragma once

#include <optional>
#include <string>

namespace projectctl {

/// Claims standard input for its one reader, before it is read.
/// @throws WrongUse if it was claimed already: a second reader would find it empty, or take what belongs to
/// the
///         first one.
void claimStandardInput();

/// The content of a file, or of standard input, which it claims, if there is no name or the name is "-".
/// @throws Failure if the file cannot be read.
std::string readFileOrInput(std::optional<std::string> const& file);

} // namespace projectctl

#pragma once

namespace projectctl {

/// Claims standard input for its one reader, before it is read.
/// @throws WrongUse if it was claimed already: a second reader would find it empty, or take what belongs to
/// the
///         first one.
void claimStandardInput();

} // namespace projectctl

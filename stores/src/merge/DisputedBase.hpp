#pragma once

#include <string>

#include "text/TextBody.hpp"

namespace project::stores {

/// The base of a merge whose common version is itself an unfinished merge. Git merges the common versions of
/// a criss-cross history with each other, and the result may contain conflict markers.
///
/// Where its two sides differ, the earlier state is *disputed*: each side of our merge has resolved the
/// conflict in its own way, and neither way is the change. A disputed value is a text that no version
/// contains. A merge therefore takes over a resolution that both sides have alike, and reports any other one
/// as a conflict.
///
/// - Keys and types that differ are disputed.
/// - An address that only one side has contains what that side has, with a disputed type: removing it
///   conflicts with keeping it, and changes within it are merged.
/// - A nested node that only one side has contains disputed values. If it has no key but its identity, the
///   base does not contain it, nor an address without a node that only one side has: a merge keeps those
///   that one of its sides has.
///
/// @param ours one side of the unfinished merge, canonical and gapless, as is the other one.
/// @param disputed the text that no version contains.
TextBody disputedBase(TextBody const& ours, TextBody const& theirs, std::u16string const& disputed);

} // namespace project::stores

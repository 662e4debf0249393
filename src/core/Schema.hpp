#pragma once

/// What the project's own two nodes are addressed by, beside the public constants of ProjectManagerBase.
namespace project::management::core {

/// Type of the name node's only element.
inline constexpr char16_t const* INFO_ELEMENT = u"Info";

/// Type of the first element of the description's address.
inline constexpr char16_t const* ROOT_ELEMENT = u"Root";

} // namespace project::management::core

#pragma once

#include "project/stores/Node.hpp"
#include "text/Overlay.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// What stands directly below an address by both a body and the changes that are laid over it.
/// @param lines the body's lines strictly below the address, none where they are hidden.
/// @param entries the changes strictly below the address.
Children overlaidChildren(TextBody const& body, TextBody::Range lines, Overlay::Range entries,
                          std::size_t depth);

} // namespace project::stores

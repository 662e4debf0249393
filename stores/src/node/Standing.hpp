#pragma once

#include "project/stores/Node.hpp"

namespace project::stores {

/// What stands at an address: a node, or the address alone because it was made.
struct Standing {
    Node node;
    bool made = false;

    explicit operator bool() const noexcept { return node != nullptr || made; }
};

} // namespace project::stores

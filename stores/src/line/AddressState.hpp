#pragma once

#include "project/stores/Node.hpp"

namespace project::stores {

/// The state of an address: it has a node, or was created without a node, or neither.
struct AddressState {
    Node node;
    bool isCreated = false;

    /// False when the address has no line of its own.
    explicit operator bool() const noexcept { return node != nullptr || isCreated; }
};

} // namespace project::stores

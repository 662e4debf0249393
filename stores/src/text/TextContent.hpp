#pragma once

#include <map>
#include <utility>
#include <vector>

#include "line/AddressState.hpp"
#include "node/NodeJoin.hpp"
#include "project/stores/Change.hpp"
#include "text/Overlay.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// The definition that a text contains: its body, and an overlay with everything that is not found in the
/// body.
class TextContent {
public:
    TextContent() = default;

    explicit TextContent(TextBody body) : body_(std::move(body)) {}

    TextBody& body() noexcept { return body_; }

    TextBody const& body() const noexcept { return body_; }

    Overlay const& overlay() const noexcept { return overlay_; }

    /// Passes on the children of an address, sorted.
    void children(Address const& parent, ChildSink& children) const;

    /// The state of an address; empty if the address has no line.
    AddressState at(Address const& address) const;

    /// The addresses at or below an address that have a state, sorted.
    std::vector<Address> addressesWithin(Address const& address) const;

    /// Applies one change of a batch.
    void apply(Change const& change);

    /// Like apply, but a node that is set is joined with the existing node. Joined nodes are visible after
    /// finishJoining.
    void join(Change const& change);

    /// Must be called once after the last join.
    void finishJoining();

    /// A canonical body with this content and a batch.
    /// @throws StoreError if an address or a node of the batch is too deep for the text.
    TextBody write(Batch const& batch) const;

private:
    TextBody body_;
    Overlay overlay_;
    std::map<Address, NodeJoin>
        joins_; ///< the nodes that are being joined; they will replace those of the overlay
};

} // namespace project::stores

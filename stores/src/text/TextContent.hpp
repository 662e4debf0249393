#pragma once

#include <map>
#include <utility>
#include <vector>

#include "node/NodeJoin.hpp"
#include "project/stores/Change.hpp"
#include "text/Overlay.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// What a text says: its body with everything laid over it that is not found there.
class TextContent {
public:
    TextContent() = default;

    explicit TextContent(TextBody body) : body_(std::move(body)) {}

    TextBody& body() noexcept { return body_; }

    TextBody const& body() const noexcept { return body_; }

    Overlay const& overlay() const noexcept { return overlay_; }

    Children children(Address const& parent) const;

    /// What stands at an address; nothing where it has no line.
    Standing at(Address const& address) const;

    /// The addresses at which something stands and that are this one or lie below it, sorted.
    std::vector<Address> standingWithin(Address const& address) const;

    /// Lays one step of a batch over what is there.
    void apply(Change const& change);

    /// Like apply, but what stands at an address already is joined with what is set there. What was joined
    /// shows after finishJoining.
    void join(Change const& change);

    /// To be called once after all that is joined.
    void finishJoining();

    /// A canonical body of all this, with a batch in it.
    TextBody write(Batch const& batch) const;

private:
    TextBody body_;
    Overlay overlay_;
    std::map<Address, NodeJoin> joins_; ///< what is being joined; stands instead of what is laid over there
};

} // namespace project::stores

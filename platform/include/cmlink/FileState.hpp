#pragma once

#include "cmlink/LocalStatus.hpp"

namespace cmlink {

/// The state of one file, as a source-control adapter reports it.
class FileState {
public:
    /// The state of a file that an adapter has asked for.
    explicit FileState(LocalStatus state) noexcept : state_(state) {}

    /// Returns the state.
    LocalStatus getState() const noexcept { return state_; }

private:
    LocalStatus state_;
};

} // namespace cmlink

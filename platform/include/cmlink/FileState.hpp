#pragma once

#include "cmlink/LocalStatus.hpp"

namespace cmlink {

/// The state of one file, as a source-control adapter reports it.
class FileState {
public:
    explicit FileState(LocalStatus state) noexcept : state_(state) {}

    LocalStatus getState() const noexcept { return state_; }

private:
    LocalStatus state_;
};

} // namespace cmlink

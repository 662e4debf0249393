#pragma once

#include <map>
#include <mutex>

#include "project/stores/Change.hpp"

namespace project::stores {

/// Collects what others have changed, look by look, until somebody asks for it.
///
/// add needs the store for itself alone; take may come from several readers at once.
class ChangeLog {
public:
    /// Takes in what a look has found. The first look is the beginning, and not a change.
    void add(Changes const& changes);

    /// All since the last time, as one change: each address once, sorted; without those that are as before.
    Changes take();

private:
    struct Ends {
        Node before;
        Node after;
    };

    std::mutex taking_;
    bool hasBegun_ = false;
    bool everything_ = false;
    std::map<Address, Ends> differences_;
};

} // namespace project::stores

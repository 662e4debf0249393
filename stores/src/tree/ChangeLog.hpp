#pragma once

#include <map>
#include <mutex>

#include "project/stores/Change.hpp"

namespace project::stores {

/// Collects the changes of other processes until they are requested.
///
/// add must not run at the same time as any other operation of the store; several readers may call take at
/// the same time.
class ChangeLog {
public:
    /// Adds the changes that one check has found. The result of the first check is the initial state and not
    /// a change.
    void add(Changes const& changes);

    /// The changes since the last call, each address once, sorted; without addresses that are as before.
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

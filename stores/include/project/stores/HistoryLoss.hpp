#pragma once

#include <cstdint>

namespace project::stores {

/// A part of a shared project's history that the server does not have any more, although this client has seen
/// it.
struct HistoryLoss {
    /// The reason of the loss.
    enum class Kind {
        Cleaned, ///< the log begins after the version that was seen: its owner deleted the older history
        Reset, ///< the version that was seen does not exist or has other content: the server was reset to an
               ///< earlier state, and batches that were committed may be lost
    };

    Kind kind;           ///< the reason
    std::uint64_t seen;  ///< the newest version that this client had seen
    std::uint64_t found; ///< the newest version on the server now
};

} // namespace project::stores

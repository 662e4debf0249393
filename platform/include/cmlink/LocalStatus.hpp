#pragma once

namespace cmlink {

/// The state of a file on disk in source control. An adapter may return other numbers too.
enum class LocalStatus : int {
    NotUnderSourceControl = 0,
    Unmodified = 1,
    Ignored = 2,
    Modified = 3, ///< or deleted from the disk while still tracked
    Conflicted = 4,
    Added = 5,
    RemovalStaged = 6,
    Renamed = 7, ///< or of another type than before
    NotInRepository = 8,
    Unknown = 9,
};

} // namespace cmlink

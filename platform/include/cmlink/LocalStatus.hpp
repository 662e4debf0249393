#pragma once

namespace cmlink {

/// How one file on disk stands to source control. An adapter may give further numbers; whoever asks acts by
/// the number.
enum class LocalStatus : int {
    NotUnderSourceControl = 0,
    Unmodified = 1,
    Ignored = 2,
    Modified = 3, ///< or gone from the disk while still tracked
    Conflicted = 4,
    Added = 5,
    RemovalStaged = 6,
    Renamed = 7, ///< or of another type than before
    NotInRepository = 8,
    Unknown = 9,
};

} // namespace cmlink

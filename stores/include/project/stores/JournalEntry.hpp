#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace project::stores {

/// The identity of an entry in a journal. Two logs that differ anywhere differ in the identity of their
/// newest entries, so an equal identity means that nothing has changed.
struct JournalPosition {
    std::uint64_t version = 0; ///< counted from 1 without gaps; 0 is the position before the first entry
    std::string id;  ///< a UUID in lower case, 36 characters, chosen by the writer; empty at version 0
    std::string sum; ///< the checksum of the entry, 32 lower-case hexadecimal digits; empty at version 0

    friend bool operator==(JournalPosition const&, JournalPosition const&) = default;
};

/// One entry of a journal, as it was read. Nothing has been verified.
///
/// A *batch* contains the lines of one batch of a text's tail, including the closing line. Its `sum` and
/// `after` are those of the closing line.
///
/// A *body* contains a complete canonical text without a tail. Its `sum` is the checksum of the body's lines,
/// to which the next batch chains. If the body was written together with a batch, the entry may contain the
/// lines of that batch too: a reader that has the state before applies them and computes the body, instead of
/// fetching it.
struct JournalEntry {
    JournalPosition position; ///< its version and its identity
    bool isBody = false;      ///< otherwise it is a batch
    std::string after;        ///< the sum of the entry before; empty for version 1
    std::string lines; ///< with line ends; empty for a body without a batch, and where look leaves it out
};

/// An entry to be appended. The views are valid during the call that receives it.
struct NewJournalEntry {
    JournalPosition position; ///< its version and its identity
    bool isBody = false;      ///< whether it is a body; otherwise it is a batch
    std::string_view after;   ///< the sum of the entry before it
    std::string_view lines;   ///< at most Journal::longestBatch bytes
    std::string_view body;    ///< of a body, otherwise empty
};

/// The author and time of an entry, for people.
struct JournalRecord {
    JournalPosition position;                   ///< its version and its identity
    bool isBody = false;                        ///< whether it is a body; otherwise it is a batch
    std::string author;                         ///< the user as the server authenticated it
    std::string host;                           ///< as the author's client reported it; may be empty
    std::chrono::system_clock::time_point time; ///< by the server's clock
};

/// The result of a check for changes.
struct JournalLook {
    std::vector<JournalEntry> entries; ///< by version, without gaps

    /// The bytes of the body that entries begins with, if the look was one without a version. Empty also if
    /// they cannot be read: Journal::body then throws the reason.
    std::optional<std::string> body;
};

} // namespace project::stores

#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "connection/Result.hpp"
#include "connection/Statement.hpp"
#include "project/stores/JournalEntry.hpp"

namespace project::postgresql {

/// The statements of one check for changes, and its result from their answers.
class LookRows {
public:
    /// @param project a UUID.
    LookRows(std::string const& project, std::optional<std::uint64_t> seen);

    /// Whether the answers contain a body.
    bool hasBody() const { return !seen_; }

    /// The calls refer to this object.
    std::vector<Call> calls() const;

    /// @param answers to the calls, in their order.
    /// @param where the service and the project, for messages.
    /// @return nothing if the entries and the pieces are from different moments: look again.
    /// @throws StoreError with the kind Refused if the project does not exist, is not visible to the user, or
    ///         has a later format.
    std::optional<stores::JournalLook> read(std::vector<Result> const& answers,
                                            std::string const& where) const;

    /// The process that answered.
    static std::int64_t process(std::vector<Result> const& answers);

private:
    std::string const& project_;
    std::optional<std::string> seen_; ///< nothing: from the newest body on, with its pieces
};

/// The text of a body from rows of number and bytes.
/// @return nothing if a piece is missing or unreadable.
std::optional<std::string> readPieces(Result const& rows, std::int64_t count);

/// The error for a project that is not in the database, or not for this user.
[[noreturn]] void throwNoProject(std::string const& where);

} // namespace project::postgresql

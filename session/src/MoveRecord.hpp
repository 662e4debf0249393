#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "project/session/Move.hpp"
#include "project/stores/Disk.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Moves in groups. The moves of one group have no path in common, so their order does not matter.
using MoveGroups = std::vector<std::vector<Move>>;

/// The moves of a record, and the states of the definition and of git's index before them.
struct RecordedMoves {
    std::string definition;
    std::string index;
    MoveGroups groups;
};

/// A file beside the project's text in which a process writes down its moves before it begins with them, so
/// that another process can complete them or roll them back. It exists only while a move is going on, or
/// after a crash. docs/store/moving.md describes it.
///
/// Used under the store's write guard.
class MoveRecord {
public:
    /// The folder below the store's, and the file in it.
    static constexpr char16_t const* folderName = u"local";
    static constexpr char const* name = "moves";

    /// @param root of the project. @param storeFolder the store's folder. Both borrowed.
    MoveRecord(Path const& root, Path const& storeFolder);

    /// Whether there is a record. Costs one system call.
    bool exists() const;

    /// Durable when it returns.
    void write(RecordedMoves const& moves);

    /// The moves; nothing if there is no record. A record that was copied from another folder, or is not
    /// complete, has none.
    std::optional<RecordedMoves> read() const;

    /// Deletes the record, and its folder if nothing else is in it.
    void remove();

private:
    void replace(char const* file, std::string_view content);
    std::string identity() const;

    Path const& root_;
    Path const& storeFolder_;
    std::unique_ptr<stores::Disk> disk_;
};

} // namespace project::session

#pragma once

#include <chrono>
#include <optional>
#include <string_view>

#include "project/stores/Backend.hpp"
#include "project/stores/Disk.hpp"
#include "text/ProjectText.hpp"

namespace project::stores {

/// The text of the store as it was read last, with the check for changes.
///
/// The identity of the file shows most changes: one system call. Two cases need more. Two writes within one
/// tick of the file system's clock may leave the same times; a text with recent times is therefore read again
/// at the next check and compared, unless the store stamped it. And a file may be read while git or an editor
/// is still writing it; an incomplete text is read again, and is never taken for an empty project.
class SeenText {
public:
    /// @param mayVanish a text that is missing was deleted, and nothing will write it again.
    SeenText(Disk& disk, bool mayVanish) : disk_(disk), mayVanish_(mayVanish) {}

    /// Finds and applies the changes since the last check. If it throws, the earlier text stays.
    /// @param patience how long to wait for an incomplete text.
    /// @throws StoreError if the text stays incomplete, or is not a project's text.
    Changes checkForChanges(std::chrono::milliseconds patience);

    /// While the folder is locked, checks use the open folder, since opening another one would release the
    /// lock.
    void stayInFolder(bool stay) noexcept { staysInFolder_ = stay; }

    /// False as long as the project has no store.
    bool exists() const noexcept { return seen_.has_value(); }

    /// These require a text that exists.
    ProjectText const& text() const noexcept { return seen_->text; }

    FileIdentity const& identity() const noexcept { return seen_->identity; }

    /// The store has replaced the text by another one.
    void replaced(ProjectText text, WrittenFile const& file);

    /// The store has appended a batch to the text.
    void appended(std::string_view lines, WrittenFile const& file);

    /// Makes the next check read the text, whatever its identity.
    void distrust() noexcept;

    /// The store has deleted the text.
    void forget() noexcept { seen_.reset(); }

private:
    struct Seen {
        ProjectText text;
        FileIdentity identity;
        bool isReliable; ///< the identity shows any later change
    };

    /// @param acceptsNoText a store may be there whose text was never created.
    /// @return false if the text must be checked again.
    bool checkOnce(Changes& changes, bool acceptsNoText);
    bool applyAppended(Changes& changes);
    bool readAll(Changes& changes, bool acceptsNoText);
    Changes differencesTo(ProjectText const& text) const;
    bool acceptMissing(Changes& changes);

    Disk& disk_;
    bool const mayVanish_;
    std::optional<Seen> seen_;
    bool staysInFolder_ = false;
    bool wasMissing_ = false; ///< a text that may vanish was, so that its content counts as added later
};

} // namespace project::stores

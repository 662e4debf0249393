#pragma once

#include <chrono>
#include <optional>
#include <string_view>

#include "project/stores/Backend.hpp"
#include "project/stores/Disk.hpp"
#include "text/ProjectText.hpp"

namespace project::stores {

/// The text of the store as it was when one last looked, and how to look again without reading it.
///
/// A file's identity tells most changes: one system call. Two cases it can't tell. Two writes within one tick
/// of the file system's clock may leave the same times: a text whose times are young is read again at the
/// next look and compared, unless we stamped it ourselves. And a file can be caught while git or an editor
/// is still writing it: a text that isn't whole is looked at again, and never taken for an empty project.
class SeenText {
public:
    explicit SeenText(Disk& disk) : disk_(disk) {}

    /// Takes in what has changed since the last look. When it throws, what was seen before stands.
    /// @param patience how long to wait for a text that isn't whole.
    /// @throws StoreError when it does not get whole, or is no text of ours.
    Changes look(std::chrono::milliseconds patience);

    /// As long as the folder is locked, looks stay with the folder that is open, since opening another one
    /// would let the lock go.
    void stayInFolder(bool stay) noexcept { staysInFolder_ = stay; }

    /// False while the project has no store.
    bool exists() const noexcept { return seen_.has_value(); }

    /// These need a text that exists.
    ProjectText const& text() const noexcept { return seen_->text; }

    FileIdentity const& identity() const noexcept { return seen_->identity; }

    /// We have put another text in the place of what was seen.
    void replaced(ProjectText text, WrittenFile const& file);

    /// We have appended a batch to what was seen.
    void appended(std::string_view lines, WrittenFile const& file);

    /// The next look reads the text, whatever its identity.
    void distrust() noexcept;

    /// What was seen is no longer there, and it was us who took it away.
    void forget() noexcept { seen_.reset(); }

private:
    struct Seen {
        ProjectText text;
        FileIdentity identity;
        bool isSettled; ///< any later change shows in the identity
    };

    /// @param mayBeUnmade a store may be there whose text was never made.
    /// @return false when the text is to be looked at again.
    bool lookOnce(Changes& changes, bool mayBeUnmade);
    bool takeInTail(Changes& changes);
    bool readAnew(Changes& changes, bool mayBeUnmade);
    bool acceptMissing();

    Disk& disk_;
    std::optional<Seen> seen_;
    bool staysInFolder_ = false;
};

/// Appends to the earlier changes the later ones.
void addChanges(Changes& earlier, Changes later);

} // namespace project::stores

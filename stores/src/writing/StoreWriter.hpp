#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "project/stores/Disk.hpp"
#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "writing/SeenText.hpp"

namespace project::stores {

/// Commits batches: appends them to the text that was read, or replaces that text. The folder must be locked.
///
/// Git and editors do not take the lock. The writer therefore checks before and after each step whether the
/// path still leads to the text that was read. A file that another program put there in the meantime is
/// restored and never deleted. If a call throws, the batch is not in the project, with one exception: if the
/// disk has failed so that the outcome is unknown, the error has that kind, and requireKnownOutcome throws
/// from then on.
class StoreWriter {
public:
    StoreWriter(Disk& disk, SeenText& seen) : disk_(disk), seen_(seen) {}

    /// Appends a batch: one write, one sync.
    void append(std::string_view lines);

    /// Replaces the text: one sync of the file, one of the folder.
    void rewrite(ProjectText next);

    /// @throws StoreError if it is unknown whether an earlier batch is in the text.
    void requireKnownOutcome() const;

private:
    /// A new text in the place of the old one. Another file stays beside it until the new name is durable, as
    /// a sign for the next writer, in case of a crash, that the names may not be.
    struct Replacement {
        WrittenFile file;
        std::string beside;
        FileIdentity besideIdentity;
        bool isExchanged; ///< the file beside it is the old text
    };

    std::optional<WrittenFile> appendOrRollBack(std::string_view lines, FileIdentity const& before);
    std::optional<Replacement> replace(std::string_view bytes, FileIdentity const& expected);
    std::optional<Replacement> exchange(std::string const& name, WrittenFile const& file,
                                        FileIdentity const& expected);
    bool isExchangedWith(FileIdentity const& expected, std::string const& name, FileIdentity const& ours);
    void undoExchange(std::string const& name, FileIdentity const& ours);
    [[noreturn]] void throwNotRestored(std::string const& name, FileIdentity const& ours);
    void abandon(Replacement const& replacement);
    void rollBack(FileIdentity const& current, StoreError const& failure);
    void setOutcomeUnknown(FileIdentity const& file);
    bool isInPlace(FileIdentity const& file);
    std::optional<FileIdentity> identifyQuietly(std::string const& name);
    bool removeOwn(std::string const& name, FileIdentity const& ours);
    [[noreturn]] void throwReplaced() const;

    Disk& disk_;
    SeenText& seen_;
    bool isOutcomeUnknown_ = false;
};

} // namespace project::stores

#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "project/stores/Disk.hpp"
#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "writing/SeenText.hpp"

namespace project::stores {

/// Puts batches on disk behind or in the place of the text that was seen. The folder must be locked.
///
/// Git and editors don't take the lock. So it is looked before and after each step whether the path still
/// leads to what was seen; what came in between is put back, and never deleted. When a call throws, the batch
/// is not in the project, with one exception: once the disk has failed so that nobody can tell, the error
/// says so, and requireKnownOutcome fails from then on.
class StoreWriter {
public:
    StoreWriter(Disk& disk, SeenText& seen) : disk_(disk), seen_(seen) {}

    /// Appends a batch: one write, one sync.
    void append(std::string_view lines);

    /// Puts another text in the place of what was seen: one sync of the file, one of the folder.
    void rewrite(ProjectText next);

    /// @throws StoreError when it is unknown whether an earlier batch is in the text.
    void requireKnownOutcome() const;

private:
    /// A new text that has taken the old one's place. Beside it lies another file until that is durable: so a
    /// writer that comes after a crash knows that the names may not be.
    struct Put {
        WrittenFile file;
        std::string beside;
        FileIdentity besideIdentity;
        bool isExchanged; ///< the file beside it is the old text
    };

    std::optional<WrittenFile> appendOrTakeBack(std::string_view lines, FileIdentity const& before);
    std::optional<Put> put(std::string_view bytes, FileIdentity const& expected);
    std::optional<Put> swapIn(std::string const& name, WrittenFile const& file, FileIdentity const& expected);
    bool hasComeOut(std::string const& name, FileIdentity const& expected, FileIdentity const& ours);
    void putBack(std::string const& name, FileIdentity const& ours);
    [[noreturn]] void throwNotPutBack(std::string const& name, FileIdentity const& ours);
    void withdraw(Put const& put);
    void takeBack(FileIdentity const& current, StoreError const& failure);
    void loseTrack(FileIdentity const& file);
    bool isInPlace(FileIdentity const& file);
    std::optional<FileIdentity> identifyQuietly(std::string const& name);
    bool removeOwn(std::string const& name, FileIdentity const& ours);
    std::string pathOfText() const;
    [[noreturn]] void throwReplaced() const;

    Disk& disk_;
    SeenText& seen_;
    bool isOutcomeUnknown_ = false;
};

} // namespace project::stores

#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Backend.hpp"
#include "project/stores/Fault.hpp"
#include "project/stores/HistoryLoss.hpp"
#include "project/stores/Journal.hpp"
#include "project/stores/JournalCache.hpp"

namespace project::stores {

/// Stores a project's definition in a Journal, the log of a project that several machines share.
///
/// The definition is the same text as in a TextBackend, divided into entries: a body, and the batches after
/// it. Each client holds the text in memory and applies the entries of other clients to it.
/// docs/store/shared.md describes the operations and the promises. Nothing is read before the first guard. No
/// files are written but those of the cache.
class PROJECT_STORES_EXPORT JournalBackend : public Backend {
public:
    /// How the backend treats the log.
    struct Options {
        /// How long to wait for another writer.
        std::chrono::milliseconds patience = std::chrono::seconds(10);

        /// A tail may always have this many bytes. Otherwise each batch of a small project would store the
        /// whole project again.
        std::size_t shortTail = std::size_t{64} * 1024;

        /// A tail may also have the length of the body divided by this. A batch that would make it longer is
        /// committed with a new body.
        std::size_t bodyToTail = 16;

        /// A read guard checks for changes if the last check is at least this long ago. A write guard always
        /// does.
        std::chrono::milliseconds freshness = std::chrono::milliseconds(0);

        /// Whether a read guard shows the last state while the server is unreachable. Otherwise it throws.
        bool readsLastState = false;
    };

    /// The size of the log's current part, and its newest entry.
    struct Status {
        JournalPosition newest; ///< the newest entry
        std::size_t bodySize;   ///< bytes of the newest body
        std::size_t tailSize;   ///< bytes of the batches after it
    };

    /// The entries that a repair has set aside. They stay in the log until its history is deleted.
    struct SetAside {
        std::uint64_t first; ///< the oldest version
        std::uint64_t last;  ///< the newest version
        bool isNothingLost;  ///< this client had read them before they were damaged
    };

    /// @param cache may be null.
    JournalBackend(std::unique_ptr<Journal> journal, Options options,
                   std::unique_ptr<JournalCache> cache = nullptr);
    /// A backend with the default options and without a cache.
    explicit JournalBackend(std::unique_ptr<Journal> journal);
    /// Stores the text in the cache if it has changed.
    ~JournalBackend() override;

    /// Checks for changes with one look; a writer also takes the lock.
    /// @throws StoreError with the kind Busy if another client holds the lock, Unreachable if the server does
    ///         not answer, Damaged if nothing of the log is readable.
    Changes enter(Access access) override;
    /// Releases the lock of a writer.
    void leave() noexcept override;
    using Backend::load;
    void load(Address const& parent, ChildSink& children) override;

    /// @return no files: the batch is on the server.
    /// @throws StoreError if an entry of the log is damaged, or if a reset of the server has not been taken
    ///         note of with takeHistoryLoss.
    FileChanges write(Batch const& batch) override;

    /// Appends one entry.
    /// @throws StoreError with the kind OutcomeUnknown if the batch may be in the project. The next guard
    /// shows
    ///         whether it is. With any other kind it is not in the project.
    void keep() override;
    void discard() noexcept override;

    // The following are called with no guard open.

    /// The loss of history that a check for changes has found since the last call. As long as a reset has not
    /// been taken, writes are refused.
    std::optional<HistoryLoss> takeHistoryLoss();

    /// The loss that takeHistoryLoss would return. A cache keeps the state before a reset until the loss is
    /// taken, so that the next process finds it, too.
    std::optional<HistoryLoss> historyLoss() const noexcept;

    /// Lets the next guard check for changes, however fresh the last check is: somebody knows that there are
    /// changes, or asks for them. May be called by any thread, also with a guard open.
    void requestCheck() noexcept;

    /// True if the last read guard showed the last state because the server was unreachable.
    bool isShowingLastState() const noexcept;

    /// Checks for changes.
    Status status();

    /// The definition as a canonical text, for a copy. Checks for changes.
    /// @throws StoreError if an entry of the log is damaged.
    std::string text();

    /// Replaces the definition by that of a complete text, as one entry.
    /// @throws StoreError if the text is incomplete, damaged or contains conflict markers.
    void replace(std::string text);

    /// Appends a body, unless the newest entry is one. The definition stays the same, and other clients do
    /// not fetch the body.
    /// @return true if a body was appended.
    bool tidy();

    /// Deletes the history before the newest body that is not newer than a version. That body is read and
    /// verified first.
    /// @return the number of deleted entries.
    /// @throws StoreError with the kind Refused if the user does not own the project.
    std::size_t deleteHistory(std::uint64_t version = std::numeric_limits<std::uint64_t>::max());

    /// The faults of the entries that this client has read. Checks for changes only if it has read none.
    std::vector<Fault> faults();

    /// Reads the log again from its newest body, and returns its faults. A problem names its version.
    std::vector<Fault> check();

    /// Sets damaged entries aside: appends a body with everything that is readable. If this client has read
    /// the newest entry before an entry was damaged, that is everything.
    /// @return nothing if no entry is damaged.
    /// @throws StoreError with the kind Refused if the user does not own the project: content may be lost.
    std::optional<SetAside> repair();

    /// The log, for its records and for awaiting changes.
    Journal& journal() noexcept;

private:
    class State;

    std::unique_ptr<State> state_;
};

} // namespace project::stores

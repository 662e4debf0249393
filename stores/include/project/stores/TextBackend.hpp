#pragma once

#include <chrono>
#include <memory>
#include <string>
#include <vector>

#include "project/stores/Backend.hpp"
#include "project/stores/Disk.hpp"
#include "project/stores/Fault.hpp"

namespace project::stores {

/// Keeps a project's definition in one text file, `.projectdata/project.jsonl` in the project's root.
///
/// docs/store/ describes the format, the steps of a commit and the promises of the store. Nothing is read
/// before the first guard, and nothing is written before the first batch.
class PROJECT_STORES_EXPORT TextBackend : public Backend {
public:
    /// How the backend treats the text.
    struct Options {
        /// How long to wait for another writer, and for a text that is incomplete.
        std::chrono::milliseconds patience = std::chrono::seconds(10);

        /// A text whose body has at most this many bytes is rewritten by every batch. Rewriting so little
        /// costs hardly more than appending to it.
        std::size_t alwaysRewritten = std::size_t{256} * 1024;

        /// Batches are appended as long as the tail is at most the length of the body divided by this.
        std::size_t bodyToTail = 16;

        /// The text belongs to one person: source control ignores everything in its folder, and the text may
        /// be deleted at any time, which leaves a store without nodes. See PersonalText.
        bool isPersonal = false;
    };

    /// The name of the store's folder in the project's root, ".projectdata".
    static char16_t const* const folderName;

    /// The name of the text in that folder, "project.jsonl".
    static char16_t const* const textName;

    /// The path of the text of the project with this root.
    static Path textPath(Path const& projectRoot);

    /// @param disk the store's folder.
    explicit TextBackend(std::unique_ptr<Disk> disk);
    /// A backend over a folder. Does not access the disk yet.
    TextBackend(std::unique_ptr<Disk> disk, Options options);
    /// Tidies the text if this object has written and no other process is writing.
    ~TextBackend() override;

    Changes enter(Access access) override;
    /// Releases the lock of a writer.
    void leave() noexcept override;
    using Backend::load;
    void load(Address const& parent, ChildSink& children) override;
    FileChanges write(Batch const& batch) override;
    void keep() override;
    void discard() noexcept override;

    /// Rewrites the text as a canonical body without a tail, unless it is that already. To be called with no
    /// guard open; waits for other writers.
    /// @return true if the text was written.
    /// @throws StoreError if the text is damaged or contains conflict markers.
    bool tidy();

    /// Sets damaged lines and batches aside in a new file in the store's folder, and rewrites the text from
    /// everything that is readable. To be called with no guard open.
    /// @return the name of the new file; empty if nothing is damaged.
    /// @throws StoreError if the text contains conflict markers, since only a person can resolve them.
    std::string repair();

    /// Replaces a text that contains conflict markers by one in which the conflicts are resolved. To be
    /// called with no guard open; waits for other writers.
    /// @param resolved a complete text; it is written in canonical form.
    /// @throws StoreError if the new text is incomplete, damaged or contains conflict markers itself, or if
    /// the
    ///         text on disk contains none.
    void resolve(std::string resolved);

    /// The numbers of the lines of the text that describe some addresses, counted from 1: of each the last
    /// one, or the first one below it if it has no line of its own, or 0 if there is none. The text is the
    /// one that was read last.
    std::vector<std::size_t> linesOf(std::vector<Address> const& addresses) const;

    /// All faults of the text as it is on disk now, by line. To be called with no guard open. Takes no lock.
    std::vector<Fault> check();

private:
    class State;

    std::unique_ptr<State> state_;
};

} // namespace project::stores

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
    struct Options {
        /// How long to wait for another writer, and for a text that is being written in pieces.
        std::chrono::milliseconds patience = std::chrono::seconds(10);

        /// A text whose body is not longer than this many bytes is written anew by every batch. Rewriting
        /// that much costs little more than appending to it.
        std::size_t alwaysRewritten = std::size_t{256} * 1024;

        /// Batches are appended as long as all of them together are not longer than the body divided by this.
        std::size_t bodyToTail = 16;
    };

    /// The name of the store's folder in the project's root, ".projectdata".
    static char16_t const* const folderName;

    /// The name of the text in that folder, "project.jsonl".
    static char16_t const* const textName;

    /// @param disk the store's folder.
    explicit TextBackend(std::unique_ptr<Disk> disk);
    TextBackend(std::unique_ptr<Disk> disk, Options options);
    /// Tidies, if this object has written and nobody else is writing.
    ~TextBackend() override;

    Changes enter(Access access) override;
    void leave() noexcept override;
    Children load(Address const& parent) override;
    FileChanges write(Batch const& batch) override;
    void keep() override;
    void discard() noexcept override;

    /// Writes the body anew without a tail, in canonical form. Without effect when the text is so already.
    /// To be called with no guard open; waits for other writers.
    /// @return true if the text was written.
    /// @throws StoreError when the text is damaged, or a merge left its markers.
    bool tidy();

    /// Sets damaged lines and batches aside into a file of their own in the store's folder, and writes the
    /// text anew from all that can be read. To be called with no guard open.
    /// @return the name of that file; empty when nothing is damaged.
    /// @throws StoreError when a merge left its markers: those are for a person to settle.
    std::string repair();

    /// Puts a text in the place of one in which a merge left its markers, where all is settled that they
    /// stand for. To be called with no guard open; waits for other writers.
    /// @param settled a whole text; it is written in canonical form.
    /// @throws StoreError when it is not whole, is damaged or has markers itself, or when the text on disk
    ///         has none.
    void settle(std::string settled);

    /// All faults of the text as it is on disk now, by line. To be called with no guard open. Takes no lock.
    std::vector<Fault> check();

private:
    class State;

    std::unique_ptr<State> state_;
};

} // namespace project::stores

#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "support/ChildProcess.hpp"
#include "support/TextStore.hpp"

namespace project::test {

/// A process that commits one batch after another until it is killed. It reports the begin and the commit of
/// each batch.
///
/// Batch n adds two files, stores its number on a third one, and removes the files of batch n - 5. One number
/// therefore describes everything that a writer has in the project, and a partial batch is detected.
class KilledWriter {
public:
    /// @param number distinguishes this writer's files from those of others.
    KilledWriter(Path const& root, std::size_t number, std::uint64_t seed);

    /// Reads its reports up to now.
    void listen();

    /// Kills it at any point, and reads the rest of its reports.
    void kill();

    /// The last batch that is certainly in the project, and the last one that may be.
    std::size_t kept() const { return kept_; }

    std::size_t begun() const { return begun_; }

    bool isAmidABatch() const { return begun_ > kept_; }

    /// The error of the store that it reported; empty if there was none.
    std::string const& complaint() const { return complaint_; }

    /// The number that it has stored in a project; 0 for none.
    std::size_t notedIn(Content const& content) const;

    /// Its content of the project after a batch and the batches before.
    Content contentWith(std::size_t batch) const;

    /// It died, and this is its last batch in the project.
    void acceptOutcome(std::size_t batch) { kept_ = begun_ = batch; }

private:
    std::size_t number_;
    std::unique_ptr<ChildProcess> process_;
    std::size_t kept_ = 0;
    std::size_t begun_ = 0;
    std::string complaint_;
};

} // namespace project::test

#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "support/ChildProcess.hpp"
#include "support/TextStore.hpp"

namespace project::test {

/// A process that writes batch after batch into a project until it is killed, and says before each one that
/// it begins and after it that it is kept.
///
/// Batch n adds two files, notes its number on a third one, and removes what batch n - 5 added: so the whole
/// of what a writer has in the project is told by one number, and a part of a batch shows.
class KilledWriter {
public:
    /// @param number tells this writer's files from those of others.
    KilledWriter(Path const& root, std::size_t number, std::uint64_t seed);

    /// Hears what it has said by now.
    void listen();

    /// Kills it in whatever it is doing, and hears the rest.
    void kill();

    /// The last batch that surely is in the project, and the last that may be.
    std::size_t kept() const { return kept_; }

    std::size_t begun() const { return begun_; }

    bool isAmidABatch() const { return begun_ > kept_; }

    /// What it says when the store fails it; empty as long as it does not.
    std::string const& complaint() const { return complaint_; }

    /// The number that it has noted in a project; 0 for none.
    std::size_t notedIn(Content const& content) const;

    /// What it has in the project with a batch in it, and those before.
    Content contentWith(std::size_t batch) const;

    /// It was found dead with this batch in the project, and that stays so.
    void settle(std::size_t batch) { kept_ = begun_ = batch; }

private:
    std::size_t number_;
    std::unique_ptr<ChildProcess> process_;
    std::size_t kept_ = 0;
    std::size_t begun_ = 0;
    std::string complaint_;
};

} // namespace project::test

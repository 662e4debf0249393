#pragma once

#include <atomic>
#include <functional>
#include <memory>
#include <set>
#include <string>
#include <thread>
#include <vector>

#include "postgresql/SharedProjectFixture.hpp"

namespace project::postgresql {

/// Clients that append batches to one project as fast as they can, each with a journal of its own.
class WriterThreads {
public:
    /// @param open creates the journal of a client.
    WriterThreads(int count, std::function<std::unique_ptr<PostgresJournal>()> const& open);

    /// Waits until the clients have appended this many batches together.
    bool await(std::size_t count) const;

    /// Lets the clients finish their current batch.
    void finish();

    std::size_t acknowledged() const { return acknowledged_; }

    /// Errors other than the expected ones: a server that is unreachable, a lock that is not free, an unknown
    /// outcome.
    std::vector<std::string> unexpectedErrors() const;

    /// Expects that a log contains each acknowledged batch once, and none whose error said that it is not
    /// stored.
    void expectAllIn(stores::JournalLook const& look) const;

    /// Waits until every client has appended a batch, and counts the shares from then on.
    bool awaitAll();

    /// The fewest and the most batches of one client.
    std::pair<std::size_t, std::size_t> sharesOfClients() const;

private:
    struct Client {
        std::thread thread;
        std::set<std::string> stored; ///< identities of batches
        std::set<std::string> notStored;
        std::vector<std::string> errors;
        std::atomic<std::size_t> count = 0; ///< of stored, for other threads
        std::size_t notCounted = 0;         ///< at the beginning of its share
    };

    void write(Client& client, PostgresJournal& journal);
    void writeOne(Client& client, PostgresJournal& journal);

    std::atomic<bool> shouldEnd_ = false;
    std::atomic<std::size_t> acknowledged_ = 0;
    std::vector<std::unique_ptr<Client>> clients_;
};

} // namespace project::postgresql

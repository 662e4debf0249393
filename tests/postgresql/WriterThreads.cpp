#include "postgresql/WriterThreads.hpp"

#include <algorithm>
#include <limits>
#include <map>

#include "support/Waiting.hpp"

namespace project::postgresql {

WriterThreads::WriterThreads(int count, std::function<std::unique_ptr<PostgresJournal>()> const& open) {
    for (int i = 0; i < count; ++i) {
        auto& client = *clients_.emplace_back(std::make_unique<Client>());
        client.thread = std::thread([this, &client, open] {
            auto const journal = open();
            write(client, *journal);
        });
    }
}

bool WriterThreads::await(std::size_t count) const {
    return test::comesTrue([&] { return acknowledged_ >= count; });
}

void WriterThreads::finish() {
    shouldEnd_ = true;
    for (auto const& client : clients_) {
        client->thread.join();
    }
}

std::vector<std::string> WriterThreads::unexpectedErrors() const {
    std::vector<std::string> errors;
    for (auto const& client : clients_) {
        errors.insert(errors.end(), client->errors.begin(), client->errors.end());
    }
    return errors;
}

void WriterThreads::expectAllIn(stores::JournalLook const& look) const {
    std::map<std::string, int> found;
    for (auto const& entry : look.entries) {
        ++found[entry.position.id];
    }
    for (auto const& client : clients_) {
        for (auto const& id : client->stored) {
            EXPECT_EQ(found[id], 1) << "an acknowledged batch";
        }
        for (auto const& id : client->notStored) {
            EXPECT_EQ(found[id], 0) << "a batch that was reported as not stored";
        }
    }
}

bool WriterThreads::awaitAll() {
    bool const haveAllBegun = test::comesTrue([this] {
        return std::ranges::all_of(clients_, [](auto const& client) { return client->count > 0; });
    });
    for (auto const& client : clients_) {
        client->notCounted = client->count;
    }
    return haveAllBegun;
}

std::pair<std::size_t, std::size_t> WriterThreads::sharesOfClients() const {
    std::pair<std::size_t, std::size_t> shares{std::numeric_limits<std::size_t>::max(), 0};
    for (auto const& client : clients_) {
        std::size_t const share = client->count - client->notCounted;
        shares.first = std::min(shares.first, share);
        shares.second = std::max(shares.second, share);
    }
    return shares;
}

void WriterThreads::write(Client& client, PostgresJournal& journal) {
    while (!shouldEnd_) {
        try {
            writeOne(client, journal);
        } catch (StoreError const& error) {
            if (error.kind() != StoreError::Kind::Unreachable && error.kind() != StoreError::Kind::Busy) {
                client.errors.emplace_back(error.what());
            }
            std::this_thread::sleep_for(milliseconds(10));
        }
    }
}

void WriterThreads::writeOne(Client& client, PostgresJournal& journal) {
    auto const look = journal.lock(std::chrono::seconds(30), std::nullopt);
    auto const own = batch(look.entries.back().position.version + 1);
    auto const& id = own->entry.position.id;
    try {
        if (journal.append(own->entry) == Journal::Appended::Stored) {
            client.stored.insert(id);
            ++client.count;
            ++acknowledged_;
        } else {
            client.notStored.insert(id);
        }
    } catch (StoreError const& error) {
        if (error.kind() == StoreError::Kind::OutcomeUnknown) {
            journal.unlock();
            return;
        }
        client.notStored.insert(id);
        journal.unlock();
        throw;
    }
    journal.unlock();
}

} // namespace project::postgresql

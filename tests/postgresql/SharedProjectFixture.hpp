#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "postgresql/PostgresServer.hpp"
#include "project/postgresql/PostgresJournal.hpp"
#include "project/postgresql/SharedProjects.hpp"
#include "project/stores/StoreError.hpp"

namespace project::postgresql {

using std::chrono::milliseconds;
using stores::Journal;
using stores::JournalEntry;
using stores::JournalPosition;
using stores::NewJournalEntry;
using stores::StoreError;

/// The server that all tests of the program share, with a database that setup.sql prepared for the user
/// `owner`. The users anna, ben, swift, rita and eve exist, without any role.
test::PostgresServer& sharedServer();

/// Prepares the database `projects` of a server in the same way.
void prepare(test::PostgresServer& server);

/// A new random UUID.
std::string newId();

/// Settings with short limits.
ServiceSettings settingsFor(std::string const& connection);

/// A project in the database of a server, with roles of its own: anna, ben and swift write, rita reads.
SharedProject createProject(test::PostgresServer& server);

/// An entry that owns its texts.
struct OwnEntry {
    NewJournalEntry entry;
    std::string after;
    std::string lines;
    std::string body;
};

/// A sum, in the form of a text's, for a version.
std::string sumOf(std::uint64_t version);

/// A batch or a body that follows the entry with the sum of the version before.
std::unique_ptr<OwnEntry> batch(std::uint64_t version, std::string const& lines = "\"file.txt\"\n");
std::unique_ptr<OwnEntry> body(std::uint64_t version, std::string const& text, std::string const& lines = "");

/// A shared project on the shared server, with a client for anna.
class SharedProjectTest : public ::testing::Test {
protected:
    void SetUp() override;

    std::unique_ptr<PostgresJournal> open(std::string const& user) {
        return std::make_unique<PostgresJournal>(settingsFor(sharedServer().connection(user)), project.id);
    }

    /// Appends entries under the lock.
    static Journal::Appended append(Journal& journal, OwnEntry const& entry);

    SharedProject project;
    std::unique_ptr<PostgresJournal> anna;
};

/// The error of a call; of the kind Refused with the problem "nothing was thrown" if there is none.
template <class Call>
StoreError errorOf(Call const& call) {
    try {
        call();
    } catch (StoreError const& error) {
        return error;
    }
    ADD_FAILURE() << "nothing was thrown";
    return {StoreError::Kind::Refused, "", 0, "nothing was thrown", ""};
}

} // namespace project::postgresql

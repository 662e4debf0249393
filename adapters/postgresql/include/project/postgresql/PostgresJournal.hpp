#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "project/postgresql/Export.hpp"
#include "project/postgresql/ServiceSettings.hpp"
#include "project/stores/Journal.hpp"

namespace project::postgresql {

/// The log of a shared project in a PostgreSQL database that was prepared with `setup.sql`.
///
/// The lock is an advisory lock of the server's session, so the connection must lead to the server without a
/// connection pooler; one in between is detected and refused.
class PROJECT_POSTGRESQL_EXPORT PostgresJournal : public stores::Journal {
public:
    /// Does not connect.
    /// @param project the project's UUID, 36 characters.
    /// @throws StoreError with the kind Refused if that is not a UUID.
    PostgresJournal(ServiceSettings settings, std::string project);
    ~PostgresJournal() override;
    PostgresJournal(PostgresJournal const&) = delete;
    PostgresJournal& operator=(PostgresJournal const&) = delete;

    std::string name() const override;
    stores::JournalLook look(std::optional<std::uint64_t> seen) override;
    stores::JournalLook lock(std::chrono::milliseconds patience, std::optional<std::uint64_t> seen) override;
    void unlock() noexcept override;
    std::string body(stores::JournalPosition const& entry) override;
    Appended append(stores::NewJournalEntry const& entry) override;
    bool awaitChange(std::chrono::milliseconds time) override;
    void wake() noexcept override;
    std::vector<stores::JournalRecord> records(std::optional<std::uint64_t> before,
                                               std::size_t count) override;
    void requireOwner() override;
    std::size_t deleteBefore(std::uint64_t version) override;

private:
    class Implementation;
    std::unique_ptr<Implementation> implementation_;
};

} // namespace project::postgresql

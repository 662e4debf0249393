#include "Sqlite.hpp"

#include <sqlite3.h>

#include <project/stores/StoreError.hpp>

namespace sqlite_store {

using project::stores::StoreError;

namespace {

/// How long a call waits for another process.
constexpr int longestWaitInMilliseconds = 5000;

StoreError::Kind kindOf(int result) noexcept {
    switch (result & 0xFF) { // the rest of an extended code says more than a caller can act on
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
        return StoreError::Kind::Busy;
    case SQLITE_CORRUPT:
    case SQLITE_NOTADB:
        return StoreError::Kind::Damaged;
    default:
        return StoreError::Kind::DiskFailed;
    }
}

} // namespace

void Database::Closing::operator()(sqlite3* database) const noexcept {
    sqlite3_close_v2(database);
}

Database::Database(fl::filesystem::Path const& file) : file_(fl::filesystem::toSystem(file).string()) {
    sqlite3* opened = nullptr;
    int const result = sqlite3_open(file_.c_str(), &opened);
    handle_.reset(opened); // also after a failure, of which it has the description
    if (result != SQLITE_OK) {
        raiseLastError();
    }
    sqlite3_busy_timeout(opened, longestWaitInMilliseconds);
}

void Database::execute(char const* sql) {
    if (sqlite3_exec(handle_.get(), sql, nullptr, nullptr, nullptr) != SQLITE_OK) {
        raiseLastError();
    }
}

void Database::tryExecute(char const* sql) noexcept {
    sqlite3_exec(handle_.get(), sql, nullptr, nullptr, nullptr);
}

bool Database::isInTransaction() const noexcept {
    return sqlite3_get_autocommit(handle_.get()) == 0;
}

void Database::raiseLastError() const {
    throw StoreError(kindOf(sqlite3_errcode(handle_.get())), file_, 0, sqlite3_errmsg(handle_.get()), "");
}

void Database::raiseDamage(std::string const& problem) const {
    throw StoreError(StoreError::Kind::Damaged, file_, 0, problem, "Restore the database from a backup.");
}

void Statement::Finalizing::operator()(sqlite3_stmt* statement) const noexcept {
    sqlite3_finalize(statement);
}

Statement::Statement(Database& database, char const* sql) : database_(database) {
    sqlite3_stmt* prepared = nullptr;
    require(sqlite3_prepare_v2(database.handle_.get(), sql, -1, &prepared, nullptr));
    handle_.reset(prepared);
}

void Statement::bind(int place, std::int64_t number) {
    require(sqlite3_bind_int64(handle_.get(), place, number));
}

void Statement::bind(int place, std::string_view bytes) {
    require(sqlite3_bind_blob64(handle_.get(), place, bytes.data(), bytes.size(), SQLITE_TRANSIENT));
}

void Statement::require(int result) const {
    if (result != SQLITE_OK) {
        database_.raiseLastError();
    }
}

Rows::~Rows() {
    sqlite3_reset(statement_.handle_.get()); // otherwise the statement keeps its view of the database
}

bool Rows::next() {
    int const result = sqlite3_step(statement_.handle_.get());
    if (result != SQLITE_ROW && result != SQLITE_DONE) {
        statement_.database_.raiseLastError();
    }
    return result == SQLITE_ROW;
}

bool Rows::isNull(int column) const {
    return sqlite3_column_type(statement_.handle_.get(), column) == SQLITE_NULL;
}

std::int64_t Rows::number(int column) const {
    return sqlite3_column_int64(statement_.handle_.get(), column);
}

std::string_view Rows::bytes(int column) const {
    auto const* const begin = static_cast<char const*>(sqlite3_column_blob(statement_.handle_.get(), column));
    auto const size = static_cast<std::size_t>(sqlite3_column_bytes(statement_.handle_.get(), column));
    return begin == nullptr ? std::string_view() : std::string_view(begin, size);
}

} // namespace sqlite_store

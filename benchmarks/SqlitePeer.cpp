#include "SqlitePeer.hpp"

#include <stdexcept>

#include <sqlite3.h>

namespace project::benchmarks {

namespace {

void require(bool condition, sqlite3* database) {
    if (!condition) {
        throw std::runtime_error(std::string("SQLite: ") + sqlite3_errmsg(database));
    }
}

void bind(sqlite3_stmt* statement, std::string const& text) {
    sqlite3_bind_text(statement, 1, text.data(), static_cast<int>(text.size()), SQLITE_STATIC);
}

} // namespace

SqlitePeer::SqlitePeer(std::filesystem::path const& file) {
    require(sqlite3_open(file.c_str(), &database_) == SQLITE_OK, database_);
    execute("PRAGMA journal_mode=WAL");
    execute("PRAGMA synchronous=FULL");
    execute("CREATE TABLE IF NOT EXISTS nodes(path TEXT PRIMARY KEY, type TEXT) WITHOUT ROWID");
    require(sqlite3_prepare_v2(database_, "SELECT type FROM nodes WHERE path=?", -1, &select_, nullptr) ==
                SQLITE_OK,
            database_);
}

SqlitePeer::~SqlitePeer() {
    sqlite3_finalize(select_);
    sqlite3_close(database_);
}

void SqlitePeer::insert(std::vector<std::string> const& paths) {
    sqlite3_stmt* statement = nullptr;
    execute("BEGIN IMMEDIATE");
    require(sqlite3_prepare_v2(database_, "INSERT OR REPLACE INTO nodes VALUES(?, 'Info')", -1, &statement,
                               nullptr) == SQLITE_OK,
            database_);
    for (auto const& path : paths) {
        bind(statement, path);
        require(sqlite3_step(statement) == SQLITE_DONE, database_);
        sqlite3_reset(statement);
    }
    sqlite3_finalize(statement);
    execute("COMMIT");
}

bool SqlitePeer::contains(std::string const& path) {
    bind(select_, path);
    bool const found = sqlite3_step(select_) == SQLITE_ROW;
    sqlite3_reset(select_);
    return found;
}

std::size_t SqlitePeer::list() {
    sqlite3_stmt* statement = nullptr;
    require(sqlite3_prepare_v2(database_, "SELECT path FROM nodes ORDER BY path", -1, &statement, nullptr) ==
                SQLITE_OK,
            database_);
    std::vector<std::string> paths;
    while (sqlite3_step(statement) == SQLITE_ROW) {
        paths.emplace_back(reinterpret_cast<char const*>(sqlite3_column_text(statement, 0)));
    }
    sqlite3_finalize(statement);
    return paths.size();
}

void SqlitePeer::execute(char const* statement) {
    require(sqlite3_exec(database_, statement, nullptr, nullptr, nullptr) == SQLITE_OK, database_);
}

} // namespace project::benchmarks

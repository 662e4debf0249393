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

void bind(sqlite3_stmt* statement, std::string const& text, int place = 1) {
    sqlite3_bind_text(statement, place, text.data(), static_cast<int>(text.size()), SQLITE_STATIC);
}

} // namespace

SqlitePeer::SqlitePeer(std::filesystem::path const& file) {
    require(sqlite3_open(file.c_str(), &database_) == SQLITE_OK, database_);
    execute("PRAGMA journal_mode=WAL");
    execute("PRAGMA synchronous=FULL");
    execute("CREATE TABLE IF NOT EXISTS nodes(path TEXT PRIMARY KEY, type TEXT) WITHOUT ROWID");
    execute("CREATE TABLE IF NOT EXISTS labels(path TEXT, category TEXT, label TEXT,"
            " PRIMARY KEY(path, category, label)) WITHOUT ROWID");
    execute("CREATE INDEX IF NOT EXISTS byCategory ON labels(category)");
    execute("CREATE TABLE IF NOT EXISTS entries(path TEXT PRIMARY KEY, name TEXT, type TEXT, grp TEXT)"
            " WITHOUT ROWID");
    select_ = prepare("SELECT type FROM nodes WHERE path=?");
    selectLabels_ = prepare("SELECT category, label FROM labels WHERE path=?");
}

SqlitePeer::~SqlitePeer() {
    sqlite3_finalize(select_);
    sqlite3_finalize(selectLabels_);
    sqlite3_close(database_);
}

void SqlitePeer::insert(std::vector<std::string> const& paths) {
    execute("BEGIN IMMEDIATE");
    forEach("INSERT OR REPLACE INTO nodes VALUES(?, 'Info')", paths);
    execute("COMMIT");
}

void SqlitePeer::insertEntries(std::vector<std::string> const& paths) {
    execute("BEGIN IMMEDIATE");
    forEach("INSERT OR REPLACE INTO entries VALUES(?, 'name', 'Basic', 'default')", paths);
    execute("COMMIT");
}

void SqlitePeer::remove(std::vector<std::string> const& paths) {
    execute("BEGIN IMMEDIATE");
    forEach("DELETE FROM nodes WHERE path=?", paths);
    forEach("DELETE FROM entries WHERE path=?", paths);
    execute("COMMIT");
}

std::size_t SqlitePeer::entries() {
    auto* const statement =
        prepare("SELECT entries.path, name, entries.type, grp FROM entries CROSS JOIN nodes USING(path)");
    std::vector<std::string> texts;
    while (sqlite3_step(statement) == SQLITE_ROW) {
        for (int column = 0; column < 4; ++column) {
            texts.emplace_back(reinterpret_cast<char const*>(sqlite3_column_text(statement, column)));
        }
    }
    sqlite3_finalize(statement);
    return texts.size() / 4;
}

bool SqlitePeer::contains(std::string const& path) {
    bind(select_, path);
    bool const found = sqlite3_step(select_) == SQLITE_ROW;
    sqlite3_reset(select_);
    return found;
}

void SqlitePeer::putLabel(std::vector<std::string> const& paths, std::string const& category,
                          std::string const& label) {
    execute("BEGIN IMMEDIATE");
    auto* const statement = prepare("INSERT OR REPLACE INTO labels VALUES(?, ?, ?)");
    for (auto const& path : paths) {
        bind(statement, path);
        bind(statement, category, 2);
        bind(statement, label, 3);
        require(sqlite3_step(statement) == SQLITE_DONE, database_);
        sqlite3_reset(statement);
    }
    sqlite3_finalize(statement);
    execute("COMMIT");
}

std::size_t SqlitePeer::labelsOn(std::string const& path) {
    bind(selectLabels_, path);
    std::size_t count = 0;
    while (sqlite3_step(selectLabels_) == SQLITE_ROW) {
        ++count;
    }
    sqlite3_reset(selectLabels_);
    return count;
}

void SqlitePeer::deleteCategory(std::string const& category) {
    auto* const statement = prepare("DELETE FROM labels WHERE category=?");
    bind(statement, category);
    require(sqlite3_step(statement) == SQLITE_DONE, database_);
    sqlite3_finalize(statement);
}

std::size_t SqlitePeer::list() {
    auto* const statement = prepare("SELECT path FROM nodes ORDER BY path");
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

void SqlitePeer::forEach(char const* text, std::vector<std::string> const& paths) {
    auto* const statement = prepare(text);
    for (auto const& path : paths) {
        bind(statement, path);
        require(sqlite3_step(statement) == SQLITE_DONE, database_);
        sqlite3_reset(statement);
    }
    sqlite3_finalize(statement);
}

sqlite3_stmt* SqlitePeer::prepare(char const* statement) {
    sqlite3_stmt* result = nullptr;
    require(sqlite3_prepare_v2(database_, statement, -1, &result, nullptr) == SQLITE_OK, database_);
    return result;
}

} // namespace project::benchmarks

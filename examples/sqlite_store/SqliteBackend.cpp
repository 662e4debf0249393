#include "SqliteBackend.hpp"

#include <filesystem>
#include <string>

#include <project/stores/StoreError.hpp>

#include "NodeBytes.hpp"

namespace sqlite_store {

using project::metadata::PathElement;
using project::stores::Access;
using project::stores::Address;
using project::stores::Batch;
using project::stores::Change;
using project::stores::Changes;
using project::stores::ChildSink;
using project::stores::FileChanges;
using project::stores::StoreError;

namespace {

constexpr std::int64_t rootId = 0;

/// The version of the tables, which the database contains.
constexpr std::int64_t tableVersion = 1;

/// Types and locations are blobs: SQLite compares those byte by byte, which is the order of the store.
char const* const tables = R"(
    BEGIN IMMEDIATE;
    CREATE TABLE IF NOT EXISTS addresses(
        id INTEGER PRIMARY KEY,
        parent INTEGER,
        type BLOB NOT NULL,
        location BLOB NOT NULL,
        isCreated INTEGER NOT NULL DEFAULT 0,
        node BLOB,
        UNIQUE(parent, type, location));
    INSERT OR IGNORE INTO addresses(id, parent, type, location, isCreated) VALUES(0, NULL, x'', x'', 1);
    PRAGMA user_version = 1;
    COMMIT;
)";

/// Creates the folder of the store. @return the path of a file in it.
Path fileIn(Path const& folder, std::u16string const& name) {
    auto const onDisk = fl::filesystem::toSystem(folder);
    std::error_code error;
    std::filesystem::create_directory(onDisk, error);
    if (error) {
        throw StoreError(StoreError::Kind::DiskFailed, onDisk.string(), 0, error.message(), "");
    }
    return folder / name;
}

std::int64_t tableVersionOf(Database& database) {
    Statement select(database, "PRAGMA user_version");
    auto rows = select.run();
    return rows.next() ? rows.number(0) : 0;
}

/// Opens the database and creates its tables if they are missing.
Database openDatabase(Path const& file) {
    Database database(file);
    database.execute("PRAGMA journal_mode = WAL"); // readers and a writer do not wait for each other
    database.execute("PRAGMA synchronous = FULL"); // a commit is durable
    auto const version = tableVersionOf(database);
    if (version > tableVersion) {
        throw StoreError(StoreError::Kind::Refused, fl::filesystem::toSystem(file).string(), 0,
                         "a newer program has written this database", "Update this program.");
    }
    if (version == 0) {
        database.execute(tables);
    }
    return database;
}

} // namespace

SqliteBackend::SqliteBackend(Path const& folder)
    : writerLock_(fileIn(folder, u"lock.sqlite")),
      database_(openDatabase(fileIn(folder, u"project.sqlite"))),
      selectVersion_(database_, "PRAGMA data_version"),
      selectChild_(database_, "SELECT id FROM addresses WHERE parent = ? AND type = ? AND location = ?"),
      selectChildren_(database_, "SELECT type, location, node, isCreated,"
                                 " EXISTS(SELECT 1 FROM addresses below WHERE below.parent = addresses.id)"
                                 " FROM addresses WHERE parent = ? ORDER BY type, location"),
      selectEmptiness_(database_,
                       "SELECT parent, node IS NULL AND NOT isCreated"
                       " AND NOT EXISTS(SELECT 1 FROM addresses below WHERE below.parent = addresses.id)"
                       " FROM addresses WHERE id = ?"),
      insertChild_(database_, "INSERT INTO addresses(parent, type, location) VALUES(?, ?, ?) RETURNING id"),
      updateNode_(database_, "UPDATE addresses SET node = ?, isCreated = 0 WHERE id = ?"),
      updateCreated_(database_, "UPDATE addresses SET isCreated = 1 WHERE id = ?"),
      deleteTree_(database_, "WITH RECURSIVE tree(id) AS (SELECT ? UNION ALL"
                             " SELECT addresses.id FROM addresses JOIN tree ON addresses.parent = tree.id)"
                             " DELETE FROM addresses WHERE id IN tree") {
}

Changes SqliteBackend::enter(Access access) {
    try {
        begin(access);
        auto const now = version();
        bool const othersHaveWritten = seenVersion_ && *seenVersion_ != now;
        seenVersion_ = now;
        return {.everything = othersHaveWritten, .differences = {}};
    } catch (...) {
        leave();
        throw;
    }
}

void SqliteBackend::begin(Access access) {
    if (access == Access::Write) {
        writerLock_.execute("BEGIN EXCLUSIVE");
    } else {
        database_.execute("BEGIN"); // all reads of the guard see one state
    }
}

/// A number that changes whenever another connection has written. Also the first read of a transaction, which
/// determines the state that the transaction sees.
std::int64_t SqliteBackend::version() {
    auto rows = selectVersion_.run();
    rows.next();
    return rows.number(0);
}

void SqliteBackend::leave() noexcept {
    if (database_.isInTransaction()) {
        database_.tryExecute("ROLLBACK");
    }
    if (writerLock_.isInTransaction()) {
        writerLock_.tryExecute("ROLLBACK");
    }
}

void SqliteBackend::load(Address const& parent, ChildSink& children) {
    auto const id = find(parent);
    if (!id) {
        return;
    }
    try {
        auto rows = selectChildren_.run(*id);
        while (rows.next()) {
            auto const type = textOf(rows.bytes(0));
            auto const location = textOf(rows.bytes(1));
            auto const node = rows.isNull(2) ? nullptr : nodeOf(rows.bytes(2));
            children.add({type, location, node, rows.number(3) != 0, rows.number(4) != 0});
        }
    } catch (NodeBytesError const& error) {
        database_.raiseDamage(error.what());
    }
}

FileChanges SqliteBackend::write(Batch const& batch) {
    database_.execute("BEGIN IMMEDIATE");
    for (auto const& change : batch) {
        apply(change);
    }
    return {}; // the constructor has created all files
}

void SqliteBackend::keep() {
    database_.execute("COMMIT");
}

void SqliteBackend::discard() noexcept {
    if (database_.isInTransaction()) { // some failures have ended it already
        database_.tryExecute("ROLLBACK");
    }
}

void SqliteBackend::apply(Change const& change) {
    switch (change.kind) {
    case Change::Kind::Set:
        updateNode_.run(bytesOf(*change.node), findOrAdd(change.address)).next();
        break;
    case Change::Kind::Create:
        updateCreated_.run(findOrAdd(change.address)).next();
        break;
    case Change::Kind::Remove:
        remove(change.address);
        break;
    }
}

void SqliteBackend::remove(Address const& address) {
    auto const parent = find(address.parent());
    auto const id = parent ? find(*parent, address.leaf()) : std::nullopt;
    if (id) {
        deleteTree_.run(*id).next();
        removeEmptyUpwards(*parent);
    }
}

/// Deletes an address that exists only because of those below it, if there are none any more; then the same
/// for the address above it.
void SqliteBackend::removeEmptyUpwards(Id id) {
    while (id != rootId) {
        Id parent = rootId;
        {
            auto rows = selectEmptiness_.run(id);
            if (!rows.next() || rows.number(1) == 0) {
                return;
            }
            parent = rows.number(0);
        }
        deleteTree_.run(id).next();
        id = parent;
    }
}

std::optional<SqliteBackend::Id> SqliteBackend::find(Id parent, PathElement const& step) {
    auto rows = selectChild_.run(parent, bytesOf(step.getType()), bytesOf(step.getLocation()));
    return rows.next() ? std::optional(rows.number(0)) : std::nullopt;
}

std::optional<SqliteBackend::Id> SqliteBackend::find(Address const& address) {
    std::optional<Id> id = rootId;
    for (auto const& step : address.getPath()) {
        id = find(*id, step);
        if (!id) {
            break;
        }
    }
    return id;
}

SqliteBackend::Id SqliteBackend::findOrAdd(Address const& address) {
    Id id = rootId;
    for (auto const& step : address.getPath()) {
        auto const found = find(id, step);
        if (found) {
            id = *found;
            continue;
        }
        auto rows = insertChild_.run(id, bytesOf(step.getType()), bytesOf(step.getLocation()));
        rows.next();
        id = rows.number(0);
    }
    return id;
}

} // namespace sqlite_store

#pragma once

#include <cstdint>
#include <optional>

#include <project/stores/Backend.hpp>

#include "Sqlite.hpp"

namespace sqlite_store {

using fl::filesystem::Path;

/// Stores a definition in an SQLite database. Pass it to a stores::TreeMetadataManager, which is the
/// MetadataManager of a project.
///
/// Each address is a row, which refers to the row of the address above it. Several processes can use the
/// database: a reader sees one state while it holds a guard, and one process writes at a time.
class SqliteBackend : public project::stores::Backend {
public:
    /// Opens the database in a folder, or creates it.
    /// @param folder absolute. It is created if it does not exist; the folder above it must exist.
    /// @throws stores::StoreError if the database cannot be opened, or a newer program has written it.
    explicit SqliteBackend(Path const& folder);
    SqliteBackend(SqliteBackend const&) = delete;
    SqliteBackend& operator=(SqliteBackend const&) = delete;

    project::stores::Changes enter(project::stores::Access access) override;
    void leave() noexcept override;
    using Backend::load;
    void load(project::stores::Address const& parent, project::stores::ChildSink& children) override;
    project::stores::FileChanges write(project::stores::Batch const& batch) override;
    void keep() override;
    void discard() noexcept override;

private:
    using Id = std::int64_t; ///< of a row

    void begin(project::stores::Access access);
    std::int64_t version();
    std::optional<Id> find(Id parent, project::metadata::PathElement const& step);
    std::optional<Id> find(project::stores::Address const& address);
    Id findOrAdd(project::stores::Address const& address);
    void apply(project::stores::Change const& change);
    void remove(project::stores::Address const& address);
    void removeEmptyUpwards(Id id);

    /// A database without content. Its lock lasts over several transactions of the other one.
    Database writerLock_;
    Database database_;
    Statement selectVersion_;
    Statement selectChild_;
    Statement selectChildren_;
    Statement selectEmptiness_;
    Statement insertChild_;
    Statement updateNode_;
    Statement updateCreated_;
    Statement deleteTree_;
    std::optional<std::int64_t> seenVersion_;
};

} // namespace sqlite_store

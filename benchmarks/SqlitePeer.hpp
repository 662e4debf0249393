#pragma once

#include <filesystem>
#include <string>
#include <vector>

struct sqlite3;
struct sqlite3_stmt;

namespace project::benchmarks {

/// One table of paths in an SQLite database set up as one that must not lose a commit: WAL, synchronous FULL.
class SqlitePeer {
public:
    explicit SqlitePeer(std::filesystem::path const& file);
    ~SqlitePeer();
    SqlitePeer(SqlitePeer const&) = delete;
    SqlitePeer& operator=(SqlitePeer const&) = delete;

    /// Inserts all rows in one transaction.
    void insert(std::vector<std::string> const& paths);

    bool contains(std::string const& path);

    /// Reads all rows. @return how many there were.
    std::size_t list();

private:
    void execute(char const* statement);

    sqlite3* database_ = nullptr;
    sqlite3_stmt* select_ = nullptr;
};

} // namespace project::benchmarks

#pragma once

#include <filesystem>
#include <string>
#include <vector>

struct sqlite3;
struct sqlite3_stmt;

namespace project::benchmarks {

/// Tables of paths, of the labels on them and of entry points in an SQLite database set up as one that must
/// not lose a commit: WAL, synchronous FULL.
class SqlitePeer {
public:
    explicit SqlitePeer(std::filesystem::path const& file);
    ~SqlitePeer();
    SqlitePeer(SqlitePeer const&) = delete;
    SqlitePeer& operator=(SqlitePeer const&) = delete;

    /// Inserts all rows in one transaction.
    void insert(std::vector<std::string> const& paths);

    bool contains(std::string const& path);

    /// Puts the label on all paths in one transaction.
    void putLabel(std::vector<std::string> const& paths, std::string const& category,
                  std::string const& label);

    /// The labels on a path with their categories. @return how many there are.
    std::size_t labelsOn(std::string const& path);

    /// Takes all labels of a category off all paths.
    void deleteCategory(std::string const& category);

    /// Makes each path an entry point, in one transaction.
    void insertEntries(std::vector<std::string> const& paths);

    /// Reads all entry points whose path is there. @return how many there were.
    std::size_t entries();

    /// Removes paths with their entry points in one transaction.
    void remove(std::vector<std::string> const& paths);

    /// Reads all rows. @return how many there were.
    std::size_t list();

private:
    void execute(char const* statement);
    void forEach(char const* statement, std::vector<std::string> const& paths);
    sqlite3_stmt* prepare(char const* statement);

    sqlite3* database_ = nullptr;
    sqlite3_stmt* select_ = nullptr;
    sqlite3_stmt* selectLabels_ = nullptr;
};

} // namespace project::benchmarks

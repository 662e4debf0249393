#pragma once

#include <filesystem>
#include <string>
#include <vector>

struct sqlite3;
struct sqlite3_stmt;

namespace project::benchmarks {

/// An SQLite database with tables of paths, of their labels and of entry points. It is configured not to lose
/// a commit: WAL, synchronous FULL.
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

    /// Reads the labels of a path with their categories. @return their number.
    std::size_t labelsOn(std::string const& path);

    /// Removes all labels of a category from all paths.
    void deleteCategory(std::string const& category);

    /// Inserts an entry point for each path, in one transaction.
    void insertEntries(std::vector<std::string> const& paths);

    /// Reads all entry points whose path is in the table of paths. @return their number.
    std::size_t entries();

    /// Deletes paths with their entry points in one transaction.
    void remove(std::vector<std::string> const& paths);

    /// Reads all paths. @return their number.
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

#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include <fl/filesystem/Path.hpp>

struct sqlite3;
struct sqlite3_stmt;

namespace sqlite_store {

/// An open database. Every failure is a stores::StoreError with the name of the file.
class Database {
public:
    /// Opens the database in a file, which is created if it does not exist.
    explicit Database(fl::filesystem::Path const& file);

    /// Runs statements without results.
    void execute(char const* sql);

    /// The same for an end that has nobody to report to: a failure is ignored.
    void tryExecute(char const* sql) noexcept;

    bool isInTransaction() const noexcept;

    /// Throws the error of the last call.
    [[noreturn]] void raiseLastError() const;

    /// Throws the error for a content that this program cannot have written.
    [[noreturn]] void raiseDamage(std::string const& problem) const;

private:
    friend class Statement;

    struct Closing {
        void operator()(sqlite3* database) const noexcept;
    };

    std::string file_;
    std::unique_ptr<sqlite3, Closing> handle_;
};

class Rows;

/// A prepared statement, which can run any number of times.
class Statement {
public:
    Statement(Database& database, char const* sql);

    /// Begins to run with these values for the parameters, in order. Only one run at a time.
    template <class... Values>
    Rows run(Values const&... values);

private:
    friend class Rows;

    struct Finalizing {
        void operator()(sqlite3_stmt* statement) const noexcept;
    };

    void bind(int place, std::int64_t number);
    void bind(int place, std::string_view bytes);
    void require(int result) const;

    Database& database_;
    std::unique_ptr<sqlite3_stmt, Finalizing> handle_;
};

/// The results of one run. The run ends with this object.
class Rows {
public:
    explicit Rows(Statement& statement) noexcept : statement_(statement) {}

    Rows(Rows const&) = delete;
    Rows& operator=(Rows const&) = delete;
    ~Rows();

    /// Continues to the next row. @return false after the last one.
    bool next();

    bool isNull(int column) const;
    std::int64_t number(int column) const;

    /// The bytes of a column, valid until the next row.
    std::string_view bytes(int column) const;

private:
    Statement& statement_;
};

template <class... Values>
Rows Statement::run(Values const&... values) {
    int place = 0;
    (bind(++place, values), ...);
    return Rows(*this);
}

} // namespace sqlite_store

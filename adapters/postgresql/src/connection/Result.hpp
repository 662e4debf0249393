#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include <libpq-fe.h>

namespace project::postgresql {

/// The answer to one statement: rows of binary values.
class Result {
public:
    explicit Result(PGresult* result) : result_(result) {}

    PGresult const* handle() const { return result_.get(); }

    int rows() const { return PQntuples(result_.get()); }

    /// The number of rows that the statement inserted, updated or deleted.
    std::size_t affected() const;

    bool isNull(int row, int column) const { return PQgetisnull(result_.get(), row, column) != 0; }

    /// The bytes of a text or bytea. Valid as long as the result.
    std::string_view bytes(int row, int column) const;

    std::string text(int row, int column) const { return std::string(bytes(row, column)); }

    /// The value of an int, a bigint or a boolean.
    std::int64_t number(int row, int column) const;

private:
    struct Cleared {
        void operator()(PGresult* result) const noexcept { PQclear(result); }
    };

    std::unique_ptr<PGresult, Cleared> result_;
};

} // namespace project::postgresql

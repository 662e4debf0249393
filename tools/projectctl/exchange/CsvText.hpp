#pragma once

#include <cstddef>
#include <initializer_list>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// Reads text with comma-separated values as RFC 4180 defines it: a field in double quotes may contain
/// commas, line ends, and double quotes, which are doubled. A line may also end with a line feed alone.
class CsvText {
public:
    struct Record {
        std::size_t line; ///< in which it begins, from 1
        std::vector<std::string> fields;
    };

    /// @param text must outlive this object. A byte order mark is skipped.
    explicit CsvText(std::string_view text);

    /// @return the next record; empty at the end. Empty lines are skipped.
    /// @throws Failure with the line, for a quote that is not closed, and for text beside a quoted field.
    std::optional<Record> next();

private:
    std::string takeField();
    std::string takeQuoted();
    bool isAtLineEnd() const;
    void takeLineEnd();

    std::string_view rest_;
    std::size_t line_ = 1;
};

/// Appends a record with its line end. Fields are quoted only if they must be.
void appendCsvRecord(std::string& out, std::initializer_list<std::string_view> fields);

} // namespace projectctl

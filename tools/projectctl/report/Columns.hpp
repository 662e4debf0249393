#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "report/JsonWriter.hpp"

namespace projectctl {

/// Numbers, one for each row.
using Column = std::vector<std::uint64_t>;

/// Writes a column as an array, or as {"runs": [value, count, ...]} if that is shorter.
void writeColumn(JsonWriter& json, std::string_view key, Column const& column);

/// Paths in the order of `list`, front-coded: each is the length that it shares with the path before it, the
/// rest, and its ending, such as ".cpp", which is a number because most files have one of a few.
class PathColumn {
public:
    void add(std::u16string_view path);

    /// Writes the members "shared", "rests", "endings" and "endingOf". The rests are one text, joined by
    /// slashes, with an empty element before a rest that begins with a slash itself. If a rest has another
    /// slash, or is empty, which only a damaged project has, they are an array.
    void write(JsonWriter& json) const;

private:
    std::u16string last_;
    Column shared_;
    std::vector<std::u16string> rests_; ///< without their endings
    std::map<std::u16string, std::size_t> endingNumbers_;
    std::vector<std::u16string> endings_;
    Column endingOf_;
    bool hasOddRest_ = false;
};

} // namespace projectctl

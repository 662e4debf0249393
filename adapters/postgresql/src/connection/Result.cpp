#include "connection/Result.hpp"

#include <charconv>

namespace project::postgresql {

std::size_t Result::affected() const {
    std::string_view const digits = PQcmdTuples(result_.get());
    std::size_t count = 0;
    std::from_chars(digits.data(), digits.data() + digits.size(), count);
    return count;
}

std::string_view Result::bytes(int row, int column) const {
    return {PQgetvalue(result_.get(), row, column),
            static_cast<std::size_t>(PQgetlength(result_.get(), row, column))};
}

std::int64_t Result::number(int row, int column) const {
    auto const value = bytes(row, column);
    std::uint64_t number = !value.empty() && (static_cast<unsigned char>(value[0]) & 0x80U) != 0 ? ~0ULL : 0;
    for (char const byte : value) { // the most significant byte first
        number = number << 8U | static_cast<unsigned char>(byte);
    }
    return static_cast<std::int64_t>(number);
}

} // namespace project::postgresql

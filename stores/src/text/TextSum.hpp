#pragma once

#include <memory>
#include <string>
#include <string_view>

struct XXH3_state_s;

namespace project::stores {

/// The checksum of lines of a text: XXH3, 128 bits, as 32 lower-case hexadecimal digits. It does not cover
/// line ends, so that a tool that converts them does not invalidate it.
class TextSum {
public:
    TextSum();
    ~TextSum();
    TextSum(TextSum const&) = delete;
    TextSum& operator=(TextSum const&) = delete;

    /// @param line without its end.
    void add(std::string_view line) noexcept;

    /// Adds all lines of a text that ends with a line end.
    void addLines(std::string_view text) noexcept;

    std::string hex() const;

private:
    XXH3_state_s* state_;
};

} // namespace project::stores

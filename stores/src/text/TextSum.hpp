#pragma once

#include <memory>
#include <string>
#include <string_view>

struct XXH3_state_s;

namespace project::stores {

/// The checksum over lines of the text: XXH3, 128 bits, in 32 lower-case hexadecimal digits. Line ends are
/// left out, so that a tool which changes them changes no sum.
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

#include "TextCheck.hpp"

namespace review_linter {

namespace {

void checkLine(std::string_view line, std::size_t number, std::vector<Finding>& findings) {
    if (line.find('\t') != std::string_view::npos) {
        findings.push_back({number, "tab"});
    }
    if (line.ends_with(' ') || line.ends_with('\t')) {
        findings.push_back({number, "blank at the end of the line"});
    }
}

} // namespace

std::vector<Finding> check(std::string_view text) {
    std::vector<Finding> findings;
    for (std::size_t number = 1; !text.empty(); ++number) {
        auto const end = text.find('\n');
        checkLine(text.substr(0, end), number, findings);
        if (end == std::string_view::npos) {
            findings.push_back({number, "no line end after the last line"});
            break;
        }
        text.remove_prefix(end + 1);
    }
    return findings;
}

std::uint64_t hashOf(std::string_view text) noexcept {
    // FNV-1a, 64 bits
    constexpr std::uint64_t start = 14695981039346656037U;
    constexpr std::uint64_t factor = 1099511628211U;
    std::uint64_t hash = start;
    for (char const byte : text) {
        hash = (hash ^ static_cast<unsigned char>(byte)) * factor;
    }
    return hash;
}

} // namespace review_linter

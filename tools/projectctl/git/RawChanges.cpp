#include "git/RawChanges.hpp"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <optional>

namespace projectctl {

namespace {

/// Takes the text up to an end, which is dropped.
std::optional<std::string_view> takeUntil(std::string_view& text, char end) {
    auto const length = text.find(end);
    if (length == text.npos) {
        return std::nullopt;
    }
    auto const result = text.substr(0, length);
    text.remove_prefix(length + 1);
    return result;
}

/// ":100644 100644 <id> <id> R087" before the zero byte.
std::optional<RawChange> readHead(std::string_view head) {
    constexpr std::size_t words = 4; // before the status
    std::string_view word[words];
    for (auto& each : word) {
        auto const taken = takeUntil(head, ' ');
        if (!taken) {
            return std::nullopt;
        }
        each = *taken;
    }
    if (!word[0].starts_with(':') || head.empty()) {
        return std::nullopt;
    }
    RawChange change{head.front(), 0, std::string(word[2]), std::string(word[3]), {}, {}};
    std::from_chars(head.data() + 1, head.data() + head.size(), change.similarity);
    return change;
}

} // namespace

std::vector<RawChange> takeRawChanges(std::string_view& raw) {
    std::vector<RawChange> result;
    while (raw.starts_with(':')) {
        auto rest = raw;
        auto const head = takeUntil(rest, '\0');
        auto change = head ? readHead(*head) : std::nullopt;
        auto const from = takeUntil(rest, '\0');
        if (!change || !from) {
            break;
        }
        bool const hasTwoPaths = change->status == 'R' || change->status == 'C';
        auto const to = hasTwoPaths ? takeUntil(rest, '\0') : from;
        if (!to) {
            break;
        }
        change->from = *from;
        change->to = *to;
        result.push_back(*std::move(change));
        raw = rest;
    }
    return result;
}

std::vector<RawChange> readRawChanges(std::string_view raw) {
    return takeRawChanges(raw);
}

} // namespace projectctl

#include "cli/Nearest.hpp"

#include <algorithm>
#include <cstddef>

#include "fl/i18n/Utf8.hpp"

namespace projectctl {

namespace {

constexpr std::size_t longestCompared = 200; ///< the comparison takes quadratic time

char16_t lowered(char16_t unit) {
    return unit >= u'A' && unit <= u'Z' ? static_cast<char16_t>(unit - u'A' + u'a') : unit;
}

/// The number of characters to insert, delete, replace or exchange with their neighbour, regardless of case.
std::size_t distance(std::u16string_view left, std::u16string_view right) {
    std::vector<std::vector<std::size_t>> rows(left.size() + 1, std::vector<std::size_t>(right.size() + 1));
    for (std::size_t i = 0; i <= left.size(); ++i) {
        for (std::size_t j = 0; j <= right.size(); ++j) {
            if (i == 0 || j == 0) {
                rows[i][j] = i + j;
                continue;
            }
            auto const isSame = [&](std::size_t k, std::size_t l) {
                return lowered(left[k - 1]) == lowered(right[l - 1]);
            };
            rows[i][j] = std::min(
                {rows[i - 1][j] + 1, rows[i][j - 1] + 1, rows[i - 1][j - 1] + (isSame(i, j) ? 0U : 1U)});
            if (i > 1 && j > 1 && isSame(i, j - 1) && isSame(i - 1, j)) {
                rows[i][j] = std::min(rows[i][j], rows[i - 2][j - 2] + 1);
            }
        }
    }
    return rows[left.size()][right.size()];
}

/// How far a name is from the text; a beginning of at least two characters is near.
std::size_t farness(std::u16string_view wanted, std::u16string_view name) {
    bool const isBeginning = wanted.size() >= 2 && name.starts_with(wanted);
    return isBeginning ? 1 : distance(wanted, name);
}

} // namespace

std::optional<std::u16string> nearest(std::u16string_view wanted, std::vector<std::u16string> const& names) {
    std::optional<std::u16string> best;
    std::size_t limit = std::max<std::size_t>(wanted.size() / 3, 1) + 1; // a name must be nearer than this
    for (auto const& name : names) {
        if (wanted.size() > longestCompared || name.size() > longestCompared) {
            continue;
        }
        if (auto const far = farness(wanted, name);
            far < limit && far < std::max(wanted.size(), name.size())) {
            limit = far;
            best = name;
        }
    }
    return best;
}

std::optional<std::u16string> nearest(std::u16string_view wanted, std::vector<Named> const& things) {
    std::vector<std::u16string> names(things.size());
    std::ranges::transform(things, names.begin(), &Named::name);
    return nearest(wanted, names);
}

std::optional<std::string> nearest(std::string const& wanted, std::vector<std::string> const& names) {
    std::vector<std::u16string> converted(names.size());
    std::ranges::transform(names, converted.begin(),
                           [](auto const& name) { return fl::i18n::fromUtf8(name); });
    auto const found = nearest(fl::i18n::fromUtf8(wanted), converted);
    return found ? std::optional(fl::i18n::toUtf8(*found)) : std::nullopt;
}

} // namespace projectctl

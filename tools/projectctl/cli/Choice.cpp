#include "cli/Choice.hpp"

#include <algorithm>

#include "fl/i18n/Utf8.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

std::optional<std::size_t> choose(std::vector<Named> const& things, std::u16string const& wanted,
                                  char const* several) {
    auto const hasName = [&wanted](Named const& thing) { return thing.name == wanted; };
    if (std::ranges::count_if(things, hasName) > 1) {
        std::string uuids;
        for (auto const& thing : things) {
            uuids += hasName(thing) ? (uuids.empty() ? "" : ", ") + fl::i18n::toUtf8(thing.uuid) : "";
        }
        throw Failure(Message(several, wanted, uuids));
    }
    auto found = std::ranges::find_if(things, hasName);
    if (found == things.end()) {
        found = std::ranges::find(things, wanted, &Named::uuid);
    }
    return found != things.end() ? std::optional(std::size_t(found - things.begin())) : std::nullopt;
}

bool isUUID(std::u16string const& text) {
    constexpr std::size_t length = 36;
    constexpr std::u16string_view digits = u"0123456789abcdefABCDEF-";
    return text.size() == length && text.find_first_not_of(digits) == std::u16string::npos;
}

} // namespace projectctl

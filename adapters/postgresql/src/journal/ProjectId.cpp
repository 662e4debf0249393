#include "journal/ProjectId.hpp"

#include <charconv>
#include <cstddef>
#include <string_view>

#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

void requireUuid(std::string const& text, std::string const& where) {
    constexpr std::string_view form = "xxxxxxxx-xxxx-xxxx-xxxx-xxxxxxxxxxxx";
    bool isUuid = text.size() == form.size();
    for (std::size_t i = 0; isUuid && i < form.size(); ++i) {
        char const symbol = text[i];
        bool const isDigit = (symbol >= '0' && symbol <= '9') || (symbol >= 'a' && symbol <= 'f');
        isUuid = form[i] == '-' ? symbol == '-' : isDigit;
    }
    if (!isUuid) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, where, 0,
                                 errorTexts.get("NotAUuid", text), errorTexts.get("RemedyOfUuid"));
    }
}

std::int64_t lockKey(std::string const& project) {
    auto const digits = project.substr(0, 8) + project.substr(9, 4) + project.substr(14, 4);
    std::uint64_t key = 0;
    std::from_chars(digits.data(), digits.data() + digits.size(), key, 16);
    return static_cast<std::int64_t>(key);
}

} // namespace project::postgresql

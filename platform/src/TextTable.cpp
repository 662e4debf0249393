#include "fl/i18n/TextTable.hpp"

#include <algorithm>
#include <cstddef>

#include "fl/i18n/MessageCatalog.hpp"

namespace fl::i18n {

namespace {

char normalized(char symbol) {
    if (symbol == '-') {
        return '_';
    }
    return symbol >= 'A' && symbol <= 'Z' ? static_cast<char>(symbol - 'A' + 'a') : symbol;
}

/// Whether a catalog is for a locale: "de" for "de", "de_AT", "DE-at" and "de_DE.UTF-8".
bool isFor(std::string_view catalog, std::string_view locale) {
    auto const [endOfCatalog, next] = std::ranges::mismatch(catalog, locale, {}, normalized, normalized);
    bool const isWhole = endOfCatalog == catalog.end();
    return isWhole &&
           (next == locale.end() || std::string_view("_-.@").find(*next) != std::string_view::npos);
}

std::string_view patternIn(TextTable::Language const& language, std::string_view name) {
    auto const found = std::ranges::find(language.texts, name, &TextTable::Text::name);
    return found == language.texts.end() ? std::string_view() : found->pattern;
}

/// The number of the argument that a pattern has at a place; empty if there is none.
std::string_view argumentAt(std::string_view pattern, std::size_t at) {
    auto const end = pattern[at] == '{' ? pattern.find('}', at) : std::string_view::npos;
    return end == std::string_view::npos ? std::string_view() : pattern.substr(at + 1, end - at - 1);
}

} // namespace

std::string TextTable::format(std::string_view name, std::initializer_list<std::string> arguments) const {
    std::string_view const text = pattern(name);
    std::string result;
    for (std::size_t at = 0; at < text.size(); ++at) {
        auto const argument = argumentAt(text, at);
        auto const number =
            argument.size() == 1 ? static_cast<std::size_t>(argument[0] - '0') : std::size_t(-1);
        if (number < arguments.size()) {
            result += arguments.begin()[number];
            at += argument.size() + 1;
        } else {
            result += text[at];
            at += text.substr(at).starts_with("''") ? 1 : 0;
        }
    }
    return result;
}

/// The text in the language with the longest name that is for the locale; else in English.
std::string_view TextTable::pattern(std::string_view name) const {
    std::string const locale = MessageCatalog::getGlobalLocale();
    Language const* nearest = nullptr;
    for (Language const& language : languages_.subspan(1)) {
        bool const isNearer = nearest == nullptr || language.locale.size() > nearest->locale.size();
        if (isNearer && isFor(language.locale, locale) && !patternIn(language, name).empty()) {
            nearest = &language;
        }
    }
    auto const found = patternIn(nearest != nullptr ? *nearest : languages_.front(), name);
    return found.empty() ? name : found;
}

} // namespace fl::i18n

#include "fl/i18n/MessageCatalog.hpp"

#include <algorithm>
#include <array>
#include <atomic>
#include <map>
#include <mutex>
#include <optional>
#include <set>
#include <utility>
#include <variant>
#include <vector>

#include <unicode/localpointer.h>
#include <unicode/msgfmt.h>
#include <unicode/udata.h>
#include <unicode/uloc.h>
#include <unicode/ures.h>

#include "fl/i18n/Utf8.hpp"

namespace fl::i18n {

namespace {

constexpr char const* rootLocale = "root";

/// The settings of the process.
struct Settings {
    std::mutex mutex;                    ///< of the changes, and of the packages
    std::set<std::string> locales{"en"}; ///< all that were ever chosen
    /// One of them. Read without a lock: a child process may create an error after a fork.
    std::atomic<std::string const*> globalLocale = &*locales.begin();
    std::map<std::string, std::string> packages; ///< by catalog name
};

/// Never destroyed: errors may be raised while static objects are destroyed.
Settings& settings() {
    static Settings& instance = *new Settings;
    return instance;
}

/// The package of a catalog; empty if the catalog is not registered.
std::string packageOf(std::string const& catalogName) {
    Settings& all = settings();
    std::lock_guard const guard(all.mutex);
    auto const found = all.packages.find(catalogName);
    return found == all.packages.end() ? std::string() : found->second;
}

/// Whether ICU has written a text with its final zero. A text that just fits is written without it, and that
/// is only a warning.
bool isComplete(UErrorCode status) {
    return U_SUCCESS(status) && status != U_STRING_NOT_TERMINATED_WARNING;
}

/// The name of ICU's bundle for a locale identifier, without keywords. Empty for any other text: a bundle is
/// opened by this name, which must not be a path.
std::string bundleName(std::string const& locale) {
    std::array<char, ULOC_FULLNAME_CAPACITY> canonical{};
    std::array<char, ULOC_FULLNAME_CAPACITY> base{};
    UErrorCode status = U_ZERO_ERROR;
    uloc_canonicalize(locale.c_str(), canonical.data(), canonical.size(), &status);
    if (!isComplete(status)) {
        return {};
    }
    uloc_getBaseName(canonical.data(), base.data(), base.size(), &status);
    if (!isComplete(status)) {
        return {};
    }
    std::string name(base.data());
    auto const isAllowed = [](char c) {
        return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_';
    };
    return std::all_of(name.begin(), name.end(), isAllowed) ? name : std::string();
}

/// The bundles to search: the locale's own, those of its parents, and the root's.
std::vector<std::string> bundlesFor(std::string const& locale) {
    std::vector<std::string> bundles;
    std::string name = bundleName(locale);
    while (!name.empty()) {
        bundles.push_back(name);
        std::array<char, ULOC_FULLNAME_CAPACITY> parent{};
        UErrorCode status = U_ZERO_ERROR;
        uloc_getParent(name.c_str(), parent.data(), parent.size(), &status);
        name = U_FAILURE(status) ? "" : parent.data();
    }
    bundles.emplace_back(rootLocale);
    return bundles;
}

/// A text of the catalog, and the bundle that contains it.
struct Pattern {
    icu::UnicodeString text;
    std::string bundle;
};

std::optional<Pattern> findPattern(std::string const& package, std::string const& messageName,
                                   std::string const& locale) {
    for (auto const& name : bundlesFor(locale)) {
        // Opened without ICU's own fallback, which depends on the language of the environment.
        UErrorCode status = U_ZERO_ERROR;
        icu::LocalUResourceBundlePointer const bundle(
            ures_openDirect(package.c_str(), name.c_str(), &status));
        int32_t length = 0;
        auto const* text = ures_getStringByKey(bundle.getAlias(), messageName.c_str(), &length, &status);
        if (U_SUCCESS(status)) {
            return Pattern{icu::UnicodeString(text, length), name};
        }
    }
    return std::nullopt;
}

icu::UnicodeString toIcu(std::u16string const& text) {
    return {text.data(), static_cast<int32_t>(text.size())};
}

std::u16string fromIcu(icu::UnicodeString const& text) {
    return {text.getBuffer(), static_cast<std::size_t>(text.length())};
}

icu::Formattable toFormattable(resource_core::BaseMsgID::Argument const& argument) {
    if (auto const* number = std::get_if<long>(&argument)) {
        return {static_cast<int64_t>(*number)};
    }
    if (auto const* narrow = std::get_if<std::string>(&argument)) {
        return {toIcu(fromUtf8(*narrow))};
    }
    return {toIcu(std::get<std::u16string>(argument))};
}

std::optional<std::u16string> fill(Pattern const& pattern, resource_core::BaseMsgID const& message) {
    std::vector<icu::Formattable> arguments;
    for (auto const& argument : message.getArguments()) {
        arguments.push_back(toFormattable(argument));
    }
    UErrorCode status = U_ZERO_ERROR;
    icu::MessageFormat const format(pattern.text, icu::Locale(pattern.bundle.c_str()), status);
    icu::UnicodeString text;
    icu::FieldPosition position(icu::FieldPosition::DONT_CARE);
    format.format(arguments.data(), static_cast<int32_t>(arguments.size()), text, position, status);
    return U_SUCCESS(status) ? std::optional(fromIcu(text)) : std::nullopt;
}

std::u16string toText(resource_core::BaseMsgID::Argument const& argument) {
    if (auto const* number = std::get_if<long>(&argument)) {
        return fromUtf8(std::to_string(*number));
    }
    if (auto const* narrow = std::get_if<std::string>(&argument)) {
        return fromUtf8(*narrow);
    }
    return std::get<std::u16string>(argument);
}

/// The readable form of a message without a text.
std::u16string nameWithArguments(resource_core::BaseMsgID const& message) {
    std::u16string text = fromUtf8(message.getMessageName());
    char16_t const* separator = u": ";
    for (auto const& argument : message.getArguments()) {
        text += separator + toText(argument);
        separator = u", ";
    }
    return text;
}

} // namespace

std::u16string MessageCatalog::get_message(resource_core::BaseMsgID const& message) {
    return get_message(message, getGlobalLocale());
}

std::u16string MessageCatalog::get_message(resource_core::BaseMsgID const& message,
                                           std::string const& locale) {
    std::string const package = packageOf(message.getCatalogName());
    if (!package.empty()) {
        if (auto const pattern = findPattern(package, message.getMessageName(), locale)) {
            if (auto text = fill(*pattern, message)) {
                return *std::move(text);
            }
        }
    }
    return nameWithArguments(message);
}

std::string MessageCatalog::getGlobalLocale() {
    return *settings().globalLocale.load();
}

void MessageCatalog::setGlobalLocale(std::string locale) {
    Settings& all = settings();
    std::lock_guard const guard(all.mutex);
    all.globalLocale = &*all.locales.insert(std::move(locale)).first;
}

void MessageCatalog::registerCatalog(std::string const& catalogName, std::string const& packageName,
                                     void const* packageData) {
    Settings& all = settings();
    std::lock_guard const guard(all.mutex);
    if (!all.packages.contains(catalogName)) {
        UErrorCode status = U_ZERO_ERROR;
        udata_setAppData(packageName.c_str(), packageData, &status);
        if (U_SUCCESS(status)) {
            all.packages.emplace(catalogName, packageName);
        }
    }
}

} // namespace fl::i18n

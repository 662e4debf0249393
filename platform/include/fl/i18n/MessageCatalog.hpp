#pragma once

#include <string>

#include "PlatformExport.hpp"
#include "resource_core/BaseMsgID.hpp"

namespace fl::i18n {

/// The texts of messages, by catalog, message name and language.
///
/// A catalog is ICU package data with one resource bundle for each language and "root" for the fallback. A
/// text is a pattern in which {0}, {1}, ... stand for the arguments. Strings are put in just as they are;
/// numbers in the way of the language. The language of the environment has no say.
///
/// All operations may be called from any thread, and none throws anything but std::bad_alloc.
class PROJECT_PLATFORM_EXPORT MessageCatalog {
public:
    /// The message's text in the global locale.
    static std::u16string get_message(resource_core::BaseMsgID const& message);

    /// The message's text in the language that is nearest to the locale: the locale's own, else that of its
    /// parents ("de" for "de_AT"), else the root's. When no text is found or it is no valid pattern, the
    /// message's name with its arguments: "name" or "name: first, second". Some microseconds.
    /// @param locale an identifier such as "de", "de_AT" or "de-AT".
    static std::u16string get_message(resource_core::BaseMsgID const& message, std::string const& locale);

    /// The locale that is used where none is given; "en" until it is set.
    static std::string getGlobalLocale();

    static void setGlobalLocale(std::string locale);

    /// Makes a catalog known. The first catalog of a name stays: a later one is ignored.
    /// @param catalogName the name that messages give.
    /// @param packageName the name that the package was made with; one catalog each.
    /// @param packageData the whole package (a .dat file), aligned to 16 bytes, readable until the process
    ///        ends. It is used in place.
    static void registerCatalog(std::string const& catalogName, std::string const& packageName,
                                void const* packageData);
};

} // namespace fl::i18n

#pragma once

#include <string>

#include "PlatformExport.hpp"
#include "resource_core/BaseMsgID.hpp"

namespace fl::i18n {

/// The texts of messages, by catalog, message name and language.
///
/// A catalog is ICU package data with one resource bundle for each language, and the bundle "root" as the
/// fallback. A text is a pattern with the placeholders {0}, {1}, ... for the arguments. Strings are inserted
/// unchanged, numbers in the format of the language. The environment has no effect.
///
/// Any thread may call all operations. They throw std::bad_alloc only.
class PROJECT_PLATFORM_EXPORT MessageCatalog {
public:
    /// Returns the message's text in the global locale.
    static std::u16string get_message(resource_core::BaseMsgID const& message);

    /// Returns the message's text in the language that is nearest to the locale: the locale's own, else that
    /// of a parent ("de" for "de_AT"), else the root's. If there is no text or it is not a valid pattern, the
    /// result is the message's name with its arguments: "name" or "name: first, second". Takes some
    /// microseconds.
    /// @param locale an identifier such as "de", "de_AT" or "de-AT".
    static std::u16string get_message(resource_core::BaseMsgID const& message, std::string const& locale);

    /// Returns the locale that is used where no other is given; "en" until it is set.
    static std::string getGlobalLocale();

    /// Sets the locale that is used where no other is given.
    static void setGlobalLocale(std::string locale);

    /// Registers a catalog. A second catalog with the same name is ignored.
    /// @param catalogName the name by which messages refer to the catalog.
    /// @param packageName the name with which the package was built. Each package contains one catalog.
    /// @param packageData the whole package (a .dat file), aligned to 16 bytes. It is not copied and must be
    ///        readable until the process ends.
    static void registerCatalog(std::string const& catalogName, std::string const& packageName,
                                void const* packageData);
};

} // namespace fl::i18n

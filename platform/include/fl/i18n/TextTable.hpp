#pragma once

#include <concepts>
#include <initializer_list>
#include <span>
#include <string>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::i18n {

/// The texts of one library's errors, in the languages of its catalogs.
///
/// An error of a store is created while the disk, the memory or the file descriptors fail, and its arguments
/// are the bytes of names on disk. So the texts are constants of the library: finding one takes no system
/// call, no lock and part of a microsecond, and arguments are inserted byte for byte. MessageCatalog formats
/// with ICU: it converts arguments to UTF-16, and has no text at all when ICU fails.
///
/// project_compile_texts in cmake/TextTables.cmake creates a table. Any thread may call all operations.
class PROJECT_PLATFORM_EXPORT TextTable {
public:
    /// A text: {0}, {1}, ... are arguments, and an apostrophe is written twice, as in every catalog.
    struct Text {
        std::string_view name;    ///< the same in each language
        std::string_view pattern; ///< in UTF-8
    };

    /// A catalog.
    struct Language {
        std::string_view locale;     ///< "root" for English, else for example "de" or "pt_BR"
        std::span<Text const> texts; ///< in any order
    };

    /// @param languages begins with "root". It must be readable as long as this object.
    explicit constexpr TextTable(std::span<Language const> languages) noexcept : languages_(languages) {}

    /// Returns a text with its arguments in the language that is nearest to MessageCatalog's global locale. A
    /// text that this language lacks is English. The result for an unknown name is the name. Throws
    /// std::bad_alloc only.
    /// @param arguments for {0}, {1}, ...: strings, which are inserted unchanged, and whole numbers.
    template <class... Arguments>
    std::string get(std::string_view name, Arguments const&... arguments) const {
        return format(name, {asText(arguments)...});
    }

private:
    template <class Value>
    static std::string asText(Value const& value) {
        if constexpr (std::integral<Value>) {
            return std::to_string(value);
        } else {
            return std::string(std::string_view(value));
        }
    }

    std::string format(std::string_view name, std::initializer_list<std::string> arguments) const;
    std::string_view pattern(std::string_view name) const;

    std::span<Language const> languages_;
};

} // namespace fl::i18n

#pragma once

#include <concepts>
#include <cstddef>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

#include "fl/filesystem/Path.hpp"
#include "resource_core/BaseMsgID.hpp"

namespace projectctl {

/// A message of the tool: the name of its text in texts/messages, and the arguments of the text. Creating one
/// is cheap; the text is read from the catalog when it is requested.
class Message : public resource_core::BaseMsgID {
public:
    /// @param arguments for {0}, {1}, ...: names and texts, as UTF-8 or UTF-16, paths, and numbers.
    template <class... Arguments>
    explicit Message(std::string name, Arguments const&... arguments)
        : BaseMsgID(catalogName, std::move(name), sizeof...(arguments)) {
        std::size_t slot = 0;
        (setArgument(slot++, argumentOf(arguments)), ...);
    }

    /// The text in the language of the process, in UTF-8. The name with the arguments if there is no text.
    std::string text() const;

    static constexpr char const* catalogName = "projectctl:messages";

private:
    template <class Value>
    static Argument argumentOf(Value const& value) {
        if constexpr (std::integral<Value>) {
            return static_cast<long>(value);
        } else if constexpr (std::same_as<Value, fl::filesystem::Path>) {
            return value.native();
        } else if constexpr (std::convertible_to<Value const&, std::u16string_view>) {
            return std::u16string(std::u16string_view(value));
        } else {
            return std::string(std::string_view(value));
        }
    }
};

} // namespace projectctl

#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include "PlatformExport.hpp"

namespace resource_core {

/// The identity of a message: its catalog, its name in the catalog, and the arguments for the placeholders of
/// its text. It does not contain the text, so that the language is chosen when the text is requested.
class PROJECT_PLATFORM_EXPORT BaseMsgID {
public:
    /// A number, or text: narrow text is UTF-8.
    using Argument = std::variant<long, std::string, std::u16string>;

    /// @param catalogName the name with which the catalog is registered in fl::i18n::MessageCatalog.
    /// @param messageName the key of the text in that catalog.
    /// @param argumentCount the number of arguments, each of which is 0 (a long) until it is set.
    BaseMsgID(std::string catalogName, std::string messageName, std::size_t argumentCount)
        : arguments_(argumentCount),
          catalogName_(std::move(catalogName)),
          messageName_(std::move(messageName)) {}

    /// Returns the arguments, beginning with that for {0}. Narrow strings are UTF-8.
    std::vector<Argument> const& getArguments() const noexcept { return arguments_; }

    /// Returns the name of the catalog.
    std::string const& getCatalogName() const noexcept { return catalogName_; }

    /// Returns the key of the text in the catalog.
    std::string const& getMessageName() const noexcept { return messageName_; }

protected:
    /// Sets an argument. Classes of a catalog call it in their constructors.
    /// @throws std::out_of_range if the message has fewer arguments.
    void setArgument(std::size_t slot, Argument argument) { arguments_.at(slot) = std::move(argument); }

private:
    std::vector<Argument> arguments_;
    std::string catalogName_;
    std::string messageName_;
};

} // namespace resource_core

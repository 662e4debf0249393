#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include "PlatformExport.hpp"

namespace resource_core {

/// The identity of a message: the catalog and the name under which its text is found, and the arguments that
/// fill the text's placeholders. A plain value that holds no text itself, so that the language is chosen when
/// the text is asked for.
class PROJECT_PLATFORM_EXPORT BaseMsgID {
public:
    using Argument = std::variant<long, std::string, std::u16string>;

    /// @param catalogName the catalog as fl::i18n::MessageCatalog knows it.
    /// @param messageName the key of the text in that catalog.
    /// @param argumentCount how many slots to make, each a long of 0.
    BaseMsgID(std::string catalogName, std::string messageName, std::size_t argumentCount)
        : arguments_(argumentCount),
          catalogName_(std::move(catalogName)),
          messageName_(std::move(messageName)) {}

    /// The arguments, the one for {0} first. Narrow strings are UTF-8.
    std::vector<Argument> const& getArguments() const noexcept { return arguments_; }

    std::string const& getCatalogName() const noexcept { return catalogName_; }

    std::string const& getMessageName() const noexcept { return messageName_; }

protected:
    /// For the classes of a catalog, which fill their slots as they are made.
    /// @throws std::out_of_range when there is no such slot.
    void setArgument(std::size_t slot, Argument argument) { arguments_.at(slot) = std::move(argument); }

private:
    std::vector<Argument> arguments_;
    std::string catalogName_;
    std::string messageName_;
};

} // namespace resource_core

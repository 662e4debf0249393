#include "project/SharedRoles.hpp"

#include "cli/TextArguments.hpp"
#include "fl/i18n/Utf8.hpp"

namespace projectctl {

void takeRoles(CLI::App& app, CLI::Option& service, std::optional<std::string>& reader,
               std::optional<std::string>& writer) {
    takeText(app, "--reader", reader)->needs(&service);
    takeText(app, "--writer", writer)->needs(&service);
}

project::session::SharedStore sharedStore(std::string const& service, std::u16string const& name,
                                          std::optional<std::string> const& reader,
                                          std::optional<std::string> const& writer) {
    auto const role = fl::i18n::toUtf8(name);
    return {service, reader.value_or(role + "_reader"), writer.value_or(role + "_writer")};
}

} // namespace projectctl

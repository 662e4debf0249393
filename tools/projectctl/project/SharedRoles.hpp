#pragma once

#include <optional>
#include <string>

#include <CLI/CLI.hpp>

#include "project/session.hpp"

namespace projectctl {

/// Declares the options for the roles of a new shared project, `--reader` and `--writer`.
/// @param service the option without which they have no meaning.
void takeRoles(CLI::App& app, CLI::Option& service, std::optional<std::string>& reader,
               std::optional<std::string>& writer);

/// Where to create a shared project. Unless the user names the roles, they are named after the project.
project::session::SharedStore sharedStore(std::string const& service, std::u16string const& name,
                                          std::optional<std::string> const& reader,
                                          std::optional<std::string> const& writer);

} // namespace projectctl

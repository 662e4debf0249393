#pragma once

#include <optional>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

namespace projectctl {

/// Declares an argument or an option that takes one text, byte for byte as it was given.
/// @param name "NAME" for an argument, "--name" for an option. @param value lives as long as the app.
CLI::Option* takeText(CLI::App& app, std::string const& name, std::optional<std::string>& value,
                      std::string const& description);

/// Declares an argument that takes one or more texts, byte for byte as they were given.
CLI::Option* takeTexts(CLI::App& app, std::string const& name, std::vector<std::string>& values,
                       std::string const& description);

/// Reads the command line, and runs the command that it calls for.
/// @param version what --version shows.
/// @return the exit code: 0, 1 for a failure, 2 for a wrong use of the tool.
int runCommandLine(int argc, char const* const* argv, std::string const& version);

} // namespace projectctl

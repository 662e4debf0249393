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

/// The arguments of a command line in the form in which the parser leaves them alone. `takeText` and
/// `takeTexts` return them to the form in which they were given.
std::vector<std::string> markedArguments(int argc, char const* const* argv);

/// One of these arguments in the form in which it was given.
std::string unmarked(std::string const& argument);

/// A text of the parser, which may quote arguments, in the form in which they were given.
std::string withoutMarks(std::string text);

} // namespace projectctl

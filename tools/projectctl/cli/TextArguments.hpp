#pragma once

#include <optional>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

namespace projectctl {

/// Declares an argument or an option with one text, byte for byte as it was given.
/// @param name "NAME" for an argument, "--name" for an option. @param value lives as long as the app.
CLI::Option* takeText(CLI::App& app, std::string const& name, std::optional<std::string>& value,
                      std::string const& description = {});

/// Declares an argument with one or more texts, byte for byte as they were given.
CLI::Option* takeTexts(CLI::App& app, std::string const& name, std::vector<std::string>& values,
                       std::string const& description = {});

/// The arguments of a command line, without the tool's name, with marks, which keep the parser from
/// interpreting texts. `takeText` and `takeTexts` remove the marks.
std::vector<std::string> markedArguments(std::vector<std::string> const& given);

/// One of these arguments in the form in which it was given.
std::string unmarked(std::string const& argument);

/// Removes all marks from a message of the parser, which may quote arguments.
std::string withoutMarks(std::string text);

} // namespace projectctl

#pragma once

#include <map>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

namespace projectctl {

/// The place of the word that is being typed, among the arguments that the parser knows.
struct TypedPlace {
    CLI::App* command = nullptr;   ///< the command whose arguments are typed: the tool, a group or a command
    CLI::Option* option = nullptr; ///< the argument or option whose value is typed; null for a name
    std::string word;              ///< the typed part of the value or the name
    std::string before;            ///< the part of the word before the value: "--type="
    bool optionsEnded = false;     ///< "--" was typed
    std::map<CLI::Option const*, std::vector<std::string>> values; ///< of arguments and options typed before
};

/// Finds the place of the last of some words. The parser itself cannot: the words before it are not complete.
/// @param tool with all commands. @param words the arguments, at least one.
/// @throws Failure if a command or an option among the words before the last one does not exist.
TypedPlace placeOfLast(std::vector<std::string> const& words, CLI::App& tool);

} // namespace projectctl

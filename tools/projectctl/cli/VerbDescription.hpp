#pragma once

#include <optional>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

namespace projectctl {

/// An option or an argument of a verb, as the help and the manual pages describe it.
struct OptionDescription {
    std::vector<std::string> names; ///< "-0" and "--null"; of an argument, its one name
    std::string value;              ///< the word for the value of an option; empty for a flag
    std::string text;               ///< what it does
    bool isRequired = false;
    bool isRepeated = false;
};

/// A verb as the help, the manual pages and the guide describe it: its declaration to the parser, with the
/// texts of the catalog.
struct VerbDescription {
    std::string name;    ///< "label put"; empty for the tool itself
    std::string summary; ///< one line
    std::string details; ///< sentences; may be empty
    std::string example; ///< a call; may be empty
    std::string purpose; ///< the message with the heading under which the tool's help shows the verb
    std::vector<OptionDescription> arguments;
    std::vector<OptionDescription> options;
    std::vector<VerbDescription> members; ///< of a group of verbs

    /// The words that call it: "projectctl label put".
    std::string call() const;

    /// The call with placeholders: "projectctl label put [OPTIONS] CATEGORY LABEL PATH...".
    std::string usage() const;
};

/// An exit code of the tool, as the help and the manual page describe it.
struct ExitCodeDescription {
    std::string code;
    std::string text;
};

/// The exit codes in ascending order.
std::vector<ExitCodeDescription> describeExitCodes();

/// The summary of a verb.
std::string summaryOf(CLI::App const& verb);

/// The description of an option or an argument of a verb.
std::string descriptionOf(CLI::Option const& option, CLI::App const& verb);

/// Describes a declared verb, or the whole tool.
VerbDescription describe(CLI::App const& declared);

} // namespace projectctl

#pragma once

#include <memory>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

#include "cli/Command.hpp"

namespace projectctl {

/// The parser with the verbs of the tool declared to it.
class DeclaredTool {
public:
    /// The option of every command that writes its result, or an error, as JSON.
    static constexpr char const* jsonOption = "--json";

    /// Declares all verbs.
    explicit DeclaredTool(CommandList const& verbs);

    /// Declares the one with this name; all verbs if there is none, so that the parser can show them or say
    /// what is wrong.
    DeclaredTool(CommandList const& verbs, std::string const& name);

    CLI::App& parser() noexcept { return *parser_; }

    /// Finds a verb by the words that call it. No words find the tool itself.
    /// @throws WrongUse for an unknown word.
    CLI::App const& find(std::vector<std::string> const& words) const;

    /// Parses arguments, as `markedArguments` returns them.
    /// @return the command that they call; of a group, its member.
    /// @throws CLI::ParseError
    std::unique_ptr<Command> parse(std::vector<std::string> arguments);

private:
    struct Declared {
        std::unique_ptr<Command> command;
        CLI::App* app;
    };

    void declare(NamedCommand const& verb);

    std::unique_ptr<CLI::App> parser_;
    std::vector<Declared> declared_;
};

} // namespace projectctl

#include "CommandLine.hpp"

#include <algorithm>
#include <iterator>
#include <span>
#include <string_view>

#include "Commands.hpp"
#include "Output.hpp"
#include "Settings.hpp"

namespace projectctl {

namespace {

// Arguments are bytes of names, and the parser has views on some: it takes "[a,b]" apart as a list, "++" ends
// a command, and what follows "--" is an argument only if none came before. A mark in front keeps it off
// them.
constexpr char mark = '\x01';

bool isSpecial(std::string_view text) {
    return text.starts_with('[') || text == "++";
}

/// What is left without the marks that the argument had to begin with.
std::string_view behindMarks(std::string_view text) {
    return text.substr(std::min(text.find_first_not_of(mark), text.size()));
}

std::string unmarked(std::string const& argument) {
    auto const rest = behindMarks(argument);
    bool const isMarked = rest.size() < argument.size() && (isSpecial(rest) || rest.starts_with('-'));
    return isMarked ? argument.substr(1) : argument;
}

std::vector<std::string> markedArguments(int argc, char const* const* argv) {
    std::vector<std::string> result;
    bool optionsEnded = false;
    for (std::string_view const argument : std::span(argv, static_cast<std::size_t>(argc)).subspan(1)) {
        if (argument == "--" && !optionsEnded) {
            optionsEnded = true;
            continue;
        }
        auto const rest = behindMarks(argument);
        bool const isDashed = rest.starts_with('-') && (optionsEnded || rest.size() < argument.size());
        result.push_back((isSpecial(rest) || isDashed ? std::string(1, mark) : std::string()) +
                         std::string(argument));
    }
    return result;
}

/// Stands wherever among the arguments, for the parser would want it before the command.
constexpr char const* sourceControlOff = "--no-source-control";

std::string withoutMarks(std::string text) {
    std::erase(text, mark);
    return text;
}

/// The command that was called for, as far as it was named, and how it is called.
struct Called {
    CLI::App const* app;
    std::string name;
};

Called calledOf(CLI::App const& tool) {
    Called result{&tool, "projectctl"};
    for (auto below = tool.get_subcommands(); !below.empty(); below = result.app->get_subcommands()) {
        result.app = below.front();
        result.name += ' ' + result.app->get_name();
    }
    return result;
}

/// What is told of a wrong use: the parser's text, and where to read on.
int refuse(CLI::ParseError const& error, CLI::App const& tool) {
    auto const called = calledOf(tool);
    auto const isGroup = !called.app->get_subcommands([](auto const*) { return true; }).empty();
    auto const unknown = isGroup ? called.app->remaining() : std::vector<std::string>();
    auto const problem =
        unknown.empty() ? error.what() : "there is no command or option \"" + unknown.front() + '"';
    printError(withoutMarks(problem) + " ('" + called.name + " --help' tells more)");
    return 2;
}

int showHelp(CLI::App const& tool) {
    auto const called = calledOf(tool);
    auto const end = called.name.rfind(' '); // of what stands before the command's own name
    output().text() +=
        called.app->help(end == std::string::npos ? std::string() : called.name.substr(0, end));
    output().flush();
    return 0;
}

} // namespace

CLI::Option* takeText(CLI::App& app, std::string const& name, std::optional<std::string>& value,
                      std::string const& description) {
    auto const take = [&value](CLI::results_t const& given) {
        value = unmarked(given.front());
        return true;
    };
    return app.add_option(name, take, description);
}

CLI::Option* takeTexts(CLI::App& app, std::string const& name, std::vector<std::string>& values,
                       std::string const& description) {
    auto const take = [&values](CLI::results_t const& given) {
        std::ranges::transform(given, std::back_inserter(values), unmarked);
        return true;
    };
    return app.add_option(name, take, description)->expected(CLI::detail::expected_max_vector_size);
}

int runCommandLine(int argc, char const* const* argv, std::string const& version) {
    CLI::App tool("Keeps the definition of an engineering project beside its files.", "projectctl");
    tool.require_subcommand(1);
    tool.set_version_flag("--version", version, "Show the version and exit");
    bool shownInHelpAlone = false;
    tool.add_flag(sourceControlOff, shownInHelpAlone,
                  "With any command: leave git alone, stage nothing, take nothing out of its index");
    auto const commands = makeCommands();
    std::vector<CLI::App*> declared;
    declared.reserve(commands.size());
    for (auto const& command : commands) {
        declared.push_back(command->declare(tool));
    }
    auto arguments = markedArguments(argc, argv);
    settings().sourceControl = std::erase(arguments, sourceControlOff) == 0;
    std::ranges::reverse(arguments); // so the parser wants them
    try {
        tool.parse(std::move(arguments));
    } catch (CLI::CallForHelp const&) {
        return showHelp(tool);
    } catch (CLI::CallForVersion const& asked) {
        output().text() += asked.what() + std::string("\n");
        output().flush();
        return 0;
    } catch (CLI::ParseError const& error) {
        return refuse(error, tool);
    }
    auto const called =
        std::find_if(declared.begin(), declared.end(), [](auto* app) { return app->parsed(); });
    auto const result = commands[static_cast<std::size_t>(called - declared.begin())]->run();
    output().flush();
    return result;
}

} // namespace projectctl

#include "CommandLine.hpp"

#include <algorithm>
#include <string_view>

#include "Commands.hpp"
#include "Output.hpp"

namespace projectctl {

namespace {

// The parser takes an argument in square brackets apart, as a list. A mark before the bracket keeps it whole.
constexpr char mark = '\x01';

bool startsWithMarksAndBracket(std::string_view text) {
    auto const first = text.find_first_not_of(mark);
    return first != std::string_view::npos && text[first] == '[';
}

std::string marked(std::string_view argument) {
    return startsWithMarksAndBracket(argument) ? mark + std::string(argument) : std::string(argument);
}

std::string unmarked(std::string const& argument) {
    return argument.front() == mark && startsWithMarksAndBracket(argument) ? argument.substr(1) : argument;
}

std::string withoutMarks(std::string text) {
    std::erase(text, mark);
    return text;
}

/// What is told of a wrong use: the parser's text, and where to read on.
int refuse(CLI::ParseError const& error, CLI::App const& tool) {
    auto const called = tool.get_subcommands();
    auto const help = called.empty() ? "projectctl" : "projectctl " + called.front()->get_name();
    printError(withoutMarks(error.what()) + " ('" + help + " --help' tells more)");
    return 2;
}

int showHelp(CLI::App const& tool) {
    auto const called = tool.get_subcommands();
    output().text() += called.empty() ? tool.help() : called.front()->help("projectctl");
    output().flush();
    return 0;
}

} // namespace

CLI::Option* takeText(CLI::App& app, std::string const& name, std::optional<std::string>& value,
                      std::string const& description) {
    auto const take = [&value](CLI::results_t const& given) {
        value = given.front().empty() ? std::string() : unmarked(given.front());
        return true;
    };
    return app.add_option(name, take, description);
}

CLI::Option* takeTexts(CLI::App& app, std::string const& name, std::vector<std::string>& values,
                       std::string const& description) {
    auto const take = [&values](CLI::results_t const& given) {
        for (auto const& text : given) {
            values.push_back(text.empty() ? text : unmarked(text));
        }
        return true;
    };
    return app.add_option(name, take, description)->expected(-1);
}

int runCommandLine(int argc, char const* const* argv, std::string const& version) {
    CLI::App tool("Keeps the definition of an engineering project beside its files.", "projectctl");
    tool.require_subcommand(1);
    tool.set_version_flag("--version", version, "Show the version and exit");
    auto const commands = makeCommands();
    std::vector<CLI::App*> declared;
    for (auto const& command : commands) {
        declared.push_back(command->declare(tool));
    }
    std::vector<std::string> arguments; // the parser wants them from the last to the first
    std::transform(argv + 1, argv + argc, std::back_inserter(arguments), marked);
    std::reverse(arguments.begin(), arguments.end());
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

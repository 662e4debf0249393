#include "cli/CommandLine.hpp"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <utility>

#include "cli/CodedFailure.hpp"
#include "cli/Completes.hpp"
#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

// The options that every command accepts. They may be anywhere among the arguments; the parser would accept
// them only before the command.
constexpr char const* sourceControlOff = "--no-source-control";
constexpr char const* fullNames = "--full-name";
constexpr char const* inFolder = "-C";

/// Declares them to the parser, for the help text alone.
void declareCommonOptions(CLI::App& tool) {
    auto const ignore = [] {};
    auto const ignoreValue = [](CLI::results_t const&) { return true; };
    auto* const folder = tool.add_option(inFolder, ignoreValue, "Run as if started in the folder DIR");
    completes(folder, Completes::Folders)->option_text("DIR");
    tool.add_flag_callback(fullNames, ignore,
                           "Show paths relative to the project's root, not to the current folder");
    tool.add_flag_callback(sourceControlOff, ignore,
                           "Do not use git: stage nothing, and remove nothing from its index");
    // Help of each command shows this, too.
    tool.footer(
        "Every command accepts -C DIR, --full-name and --no-source-control, before and after its name: see "
        "'projectctl --help'.");
}

/// Applies them and removes them from the arguments.
/// @return the folders to enter, one after the other.
std::vector<std::string> takeCommonOptions(std::vector<std::string>& arguments) {
    settings().sourceControl = std::erase(arguments, sourceControlOff) == 0;
    settings().showsFullNames = std::erase(arguments, fullNames) > 0;
    std::vector<std::string> folders;
    for (auto found = std::ranges::find(arguments, inFolder); found != arguments.end();
         found = std::ranges::find(arguments, inFolder)) {
        if (std::next(found) == arguments.end()) {
            throw WrongUse("-C needs a folder ('projectctl --help' shows the usage)");
        }
        folders.push_back(unmarked(*std::next(found)));
        arguments.erase(found, found + 2);
    }
    return folders;
}

constexpr char const* exitCodes =
    "Exit codes: 0 done; 1 the operation is not possible; 2 wrong arguments; 3 done, and a "
    "fault was found;\n4 another program is at work, try again; 5 the text is damaged; 6 "
    "the text contains conflict markers;\n7 the disk failed; 8 the outcome of a write is "
    "unknown. 'merge' has those of a merge driver.";

/// The command that the arguments name, as far as they could be parsed, and its full name.
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

/// The parser's text, and the command that shows the help.
WrongUse wrongUse(CLI::ParseError const& error, CLI::App const& tool) {
    auto const called = calledOf(tool);
    bool const isGroup = !called.app->get_subcommands([](auto const*) { return true; }).empty();
    auto const unknown = isGroup ? called.app->remaining() : std::vector<std::string>();
    std::string const problem =
        unknown.empty() ? error.what() : "unknown command or option \"" + unknown.front() + '"';
    return WrongUse(withoutMarks(problem) + " ('" + called.name + " --help' shows the usage)");
}

int showHelp(CLI::App const& tool) {
    auto const called = calledOf(tool);
    std::size_t const end = called.name.rfind(' '); // of the part before the command's own name
    output().text() +=
        called.app->help(end == std::string::npos ? std::string() : called.name.substr(0, end));
    output().flush();
    return 0;
}

int showVersion(CLI::CallForVersion const& asked) {
    output().text() += asked.what() + std::string("\n");
    output().flush();
    return 0;
}

/// A command that the parser knows.
struct Declared {
    std::unique_ptr<Command> command;
    CLI::App* app;
};

/// Declares the command that the arguments name. Declares all commands if they name none, so that the parser
/// can show them or say what is wrong.
std::vector<Declared> declareNamed(std::vector<std::string> const& arguments, CommandList const& commands,
                                   CLI::App& tool) {
    auto const named = arguments.empty()
                           ? commands.end()
                           : std::ranges::find(commands, arguments.front(), &NamedCommand::name);
    std::vector<Declared> result;
    for (auto command = commands.begin(); command != commands.end(); ++command) {
        if (named == commands.end() || command == named) {
            auto made = command->make();
            auto* const app = made->declare(tool);
            result.push_back({std::move(made), app});
        }
    }
    return result;
}

/// @return the command that the arguments call.
std::unique_ptr<Command> parse(std::vector<std::string> arguments, std::vector<Declared>& declared,
                               CLI::App& tool) {
    std::ranges::reverse(arguments); // the order that the parser expects
    tool.parse(std::move(arguments));
    auto const called = std::ranges::find_if(declared, [](auto const& item) { return item.app->parsed(); });
    auto member = called->command->takeCalledMember();
    return member ? std::move(member) : std::move(called->command);
}

} // namespace

int runCommandLine(int argc, char const* const* argv, std::string const& version,
                   CommandList const& commands) {
    auto arguments = markedArguments({argv + 1, argv + argc});
    auto const folders = takeCommonOptions(arguments);
    CLI::App tool("Manages the definition of an engineering project, stored beside its files.", "projectctl");
    tool.require_subcommand(1);
    tool.set_version_flag("--version", version, "Show the version and exit");
    declareCommonOptions(tool);
    auto declared = declareNamed(arguments, commands, tool);
    tool.footer(exitCodes); // after the commands, which take over the footer that they find
    std::unique_ptr<Command> called;
    try {
        called = parse(std::move(arguments), declared, tool);
    } catch (CLI::CallForHelp const&) {
        return showHelp(tool);
    } catch (CLI::CallForVersion const& asked) {
        return showVersion(asked);
    } catch (CLI::ParseError const& error) {
        throw wrongUse(error, tool);
    }
    std::ranges::for_each(folders, enterFolder);
    auto const result = called->run();
    output().flush();
    return result;
}

std::unique_ptr<Command> parseCommand(std::vector<std::string> const& words, CommandList const& commands) {
    auto const arguments = markedArguments(words);
    CLI::App tool("", "projectctl");
    tool.require_subcommand(1);
    auto declared = declareNamed(arguments, commands, tool);
    try {
        return parse(arguments, declared, tool);
    } catch (CLI::CallForHelp const&) {
        throw WrongUse("--help is not an option here");
    } catch (CLI::ParseError const& error) {
        throw wrongUse(error, tool);
    }
}

DeclaredTool declareTool(CommandList const& commands) {
    DeclaredTool result{std::make_unique<CLI::App>("", "projectctl"), {}};
    declareCommonOptions(*result.app);
    for (auto& declared : declareNamed({}, commands, *result.app)) {
        result.commands.push_back(std::move(declared.command));
    }
    return result;
}

bool isCommonOption(std::string const& argument) {
    return argument == inFolder || argument == fullNames || argument == sourceControlOff;
}

} // namespace projectctl

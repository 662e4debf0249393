#include "cli/CommandLine.hpp"

#include <algorithm>
#include <cstddef>

#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

/// Stands wherever among the arguments, for the parser would want it before the command.
constexpr char const* sourceControlOff = "--no-source-control";

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

int runCommandLine(int argc, char const* const* argv, std::string const& version,
                   std::vector<std::unique_ptr<Command>> const& commands) {
    CLI::App tool("Keeps the definition of an engineering project beside its files.", "projectctl");
    tool.require_subcommand(1);
    tool.set_version_flag("--version", version, "Show the version and exit");
    bool shownInHelpAlone = false;
    tool.add_flag(sourceControlOff, shownInHelpAlone,
                  "With any command: leave git alone, stage nothing, take nothing out of its index");
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

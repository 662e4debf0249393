#include "cli/CommandLine.hpp"

#include <algorithm>
#include <optional>
#include <utility>

#include "cli/CodedFailure.hpp"
#include "cli/CommonOptions.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/ExitCode.hpp"
#include "cli/ExternalVerb.hpp"
#include "cli/Pager.hpp"
#include "cli/TextArguments.hpp"
#include "cli/UsageProblem.hpp"
#include "cli/WorkingFolder.hpp"
#include "output/JsonDocument.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

std::string verbOf(std::vector<std::string> const& arguments) {
    return arguments.empty() ? std::string() : arguments.front();
}

bool isUnknownWord(std::string const& word, CommandList const& verbs) {
    bool const isWord = !word.empty() && !word.starts_with('-');
    return isWord && std::ranges::find(verbs, word, &NamedCommand::name) == verbs.end();
}

/// The parser would skip a word that it does not know, and call the verb that follows.
void requireVerb(std::string const& word, CommandList const& verbs) {
    if (isUnknownWord(word, verbs)) {
        DeclaredTool const tool(verbs);
        static_cast<void>(tool.find({unmarked(word)}));
    }
}

/// Calls the program of an unknown verb, if there is one. The options before the verb are the tool's, all
/// that follow it are the program's.
void callIfExternal(std::vector<std::string> const& given, CommandList const& verbs) {
    auto word = given.begin();
    while (word != given.end() && isCommonOption(*word)) {
        bool const hasValue = isBeforeItsValue(*word++);
        word += hasValue && word != given.end() ? 1 : 0;
    }
    if (word != given.end() && isUnknownWord(*word, verbs)) {
        std::vector<std::string> options(given.begin(), word);
        std::ranges::for_each(takeCommonOptions(options), enterFolder);
        callExternalVerb(*word, {word + 1, given.end()});
    }
}

int show(std::string const& text) {
    output().text() += text;
    output().flush();
    return exit_code::done;
}

int showVersion(std::string const& version) {
    if (!output().isJson()) {
        return show(version + '\n');
    }
    JsonDocument document(json::version);
    document.addText("projectctl", std::u16string(version.begin(), version.end()));
    document.finish();
    return show({});
}

/// The words after a hidden verb are those of another command line.
bool asksForJson(std::vector<std::string> const& arguments, CommandList const& verbs) {
    auto const verb = std::ranges::find(verbs, verbOf(arguments), &NamedCommand::name);
    bool const isHidden = verb != verbs.end() && std::string_view(verb->purpose).empty();
    return !isHidden && std::ranges::count(arguments, DeclaredTool::jsonOption) > 0;
}

/// With --json, every command that is done writes a document.
void confirmInJson(int result) {
    if (output().isJson() && !output().hasContent() && result == exit_code::done) {
        JsonDocument document(json::done);
        if (!output().confirmation().empty()) {
            document.addText("text", textOf(output().confirmation()));
        }
        document.finish();
    }
}

} // namespace

int runCommandLine(int argc, char const* const* argv, std::string const& version,
                   CommandList const& commands) {
    std::vector<std::string> const given(argv + 1, argv + argc);
    callIfExternal(given, commands);
    auto arguments = markedArguments(given);
    if (asksForJson(arguments, commands)) {
        output().beginJson(); // before any error, also of the parser
    }
    auto const folders = takeCommonOptions(arguments);
    if (verbOf(arguments) == "--version") {
        return showVersion(version);
    }
    requireVerb(verbOf(arguments), commands);
    DeclaredTool tool(commands, verbOf(arguments));
    std::unique_ptr<Command> called;
    try {
        called = tool.parse(std::move(arguments));
    } catch (CLI::CallForHelp const&) {
        return show(tool.parser().help());
    } catch (CLI::ParseError const& error) {
        throw wrongUse(error, tool.parser());
    }
    std::ranges::for_each(folders, enterFolder);
    std::optional<Pager> pager;
    if (called->isListing()) {
        pager.emplace();
    }
    auto const result = called->run();
    confirmInJson(result);
    output().flush();
    return result;
}

std::unique_ptr<Command> parseCommand(std::vector<std::string> const& words, CommandList const& commands) {
    auto arguments = markedArguments(words);
    requireVerb(verbOf(arguments), commands);
    DeclaredTool tool(commands, verbOf(arguments));
    try {
        return tool.parse(std::move(arguments));
    } catch (CLI::CallForHelp const&) {
        throw WrongUse(Message("HelpInBatch"));
    } catch (CLI::ParseError const& error) {
        throw wrongUse(error, tool.parser());
    }
}

} // namespace projectctl

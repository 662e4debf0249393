#include <csignal>
#include <exception>
#include <memory>
#include <vector>

#include "checks/Commands.hpp"
#include "cli/CommandLine.hpp"
#include "cli/Language.hpp"
#include "entrypoints/Commands.hpp"
#include "files/Commands.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "labels/Commands.hpp"
#include "merge/Commands.hpp"
#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "references/Commands.hpp"
#include "watch/Commands.hpp"

namespace {

/// All commands, in the order in which help shows them.
std::vector<std::unique_ptr<projectctl::Command>> makeCommands() {
    using namespace projectctl;
    std::vector<std::unique_ptr<Command>> result;
    for (auto* const make :
         {makeInitCommand,     makeRootCommand,      makeNameCommand,       makeDescriptionCommand,
          makeAddCommand,      makeRemoveCommand,    makeListCommand,       makeStatusCommand,
          makeCategoryCommand, makeLabelCommand,     makeEntryCommand,      makeGroupCommand,
          makePathCommand,     makeReferenceCommand, makeReferencesCommand, makeCheckCommand,
          makeWatchCommand,    makeTidyCommand,      makeSetupCommand,      makeMergeCommand,
          makeResolveCommand}) {
        result.push_back(make());
    }
    return result;
}

/// Ends as a program does whose reader has gone: by the signal, without a word.
int endOfClosedOutput() {
    std::signal(SIGPIPE, SIG_DFL);
    std::raise(SIGPIPE);
    return 1; // whoever called us holds the signal back
}

} // namespace

int main(int argc, char** argv) {
    std::signal(SIGPIPE, SIG_IGN); // a closed pipe is an error of the write to it
    std::signal(SIGXFSZ, SIG_IGN); // so is a limit on the size of files, and the store undoes what it did
    std::signal(SIGCHLD, SIG_DFL); // else, when our caller ignores it, the end of git cannot be told
    try {
        fl::i18n::MessageCatalog::setGlobalLocale(projectctl::languageOfEnvironment());
        return projectctl::runCommandLine(argc, argv, PROJECTCTL_VERSION, makeCommands());
    } catch (projectctl::OutputClosed const&) {
        return endOfClosedOutput();
    } catch (std::exception const& error) {
        projectctl::printError(error.what());
        return 1;
    }
}

#include <csignal>
#include <exception>

#include "batch/Commands.hpp"
#include "checks/Commands.hpp"
#include "cli/CommandLine.hpp"
#include "cli/ExitCode.hpp"
#include "cli/Language.hpp"
#include "completion/Commands.hpp"
#include "entrypoints/Commands.hpp"
#include "files/Commands.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "labels/Commands.hpp"
#include "merge/Commands.hpp"
#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "references/Commands.hpp"
#include "shared/Commands.hpp"
#include "watch/Commands.hpp"

namespace {

/// All commands, in the order in which help shows them.
projectctl::CommandList const& commands() {
    using namespace projectctl;
    static CommandList const result{
        {"init", makeInitCommand},
        {"root", makeRootCommand},
        {"name", makeNameCommand},
        {"description", makeDescriptionCommand},
        {"add", makeAddCommand},
        {"remove", makeRemoveCommand},
        {"list", makeListCommand},
        {"status", makeStatusCommand},
        {"category", makeCategoryCommand},
        {"label", makeLabelCommand},
        {"entry", makeEntryCommand},
        {"group", makeGroupCommand},
        {"path", makePathCommand},
        {"reference", makeReferenceCommand},
        {"references", makeReferencesCommand},
        {"batch", [] { return makeBatchCommand(commands()); }},
        {"check", makeCheckCommand},
        {"watch", makeWatchCommand},
        {"tidy", makeTidyCommand},
        {"setup", makeSetupCommand},
        {"merge", makeMergeCommand},
        {"copy", makeCopyCommand},
        {"shared", makeSharedCommand},
        {"resolve", makeResolveCommand},
        {completeCommandName, [] { return makeCompleteCommand(commands()); }},
    };
    return result;
}

/// Ends like any program whose output was closed: by the signal, without a message.
int endOfClosedOutput() {
    std::signal(SIGPIPE, SIG_DFL);
    std::raise(SIGPIPE);
    return projectctl::exit_code::failed; // the caller has blocked the signal
}

} // namespace

int main(int argc, char** argv) {
    std::signal(SIGPIPE, SIG_IGN); // so that a write to a closed pipe fails instead
    std::signal(SIGXFSZ, SIG_IGN); // the same for a limit on the size of files: the store then rolls back
    std::signal(SIGCHLD, SIG_DFL); // if the caller ignores it, we could not wait for git
    try {
        fl::i18n::MessageCatalog::setGlobalLocale(projectctl::languageOfEnvironment());
        return projectctl::runCommandLine(argc, argv, PROJECTCTL_VERSION, commands());
    } catch (projectctl::OutputClosed const&) {
        return endOfClosedOutput();
    } catch (std::exception const& error) {
        projectctl::printError(error.what());
        return projectctl::exitCodeFor(error);
    }
}

#include <csignal>
#include <exception>

#include "Verbs.hpp"
#include "cli/CommandLine.hpp"
#include "cli/ExitCode.hpp"
#include "cli/Language.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "output/Output.hpp"

namespace {

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
        return projectctl::runCommandLine(argc, argv, PROJECTCTL_VERSION, projectctl::verbs());
    } catch (projectctl::OutputClosed const&) {
        return endOfClosedOutput();
    } catch (std::exception const& error) {
        int const code = projectctl::exitCodeFor(error);
        projectctl::printFailure(error, projectctl::nameOf(code), code);
        return code;
    }
}

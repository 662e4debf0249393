#include <csignal>
#include <exception>

#include "CommandLine.hpp"
#include "Language.hpp"
#include "Output.hpp"
#include "fl/i18n/MessageCatalog.hpp"

namespace {

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
        return projectctl::runCommandLine(argc, argv, PROJECTCTL_VERSION);
    } catch (projectctl::OutputClosed const&) {
        return endOfClosedOutput();
    } catch (std::exception const& error) {
        projectctl::printError(error.what());
        return 1;
    }
}

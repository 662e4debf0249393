#include "cli/Pager.hpp"

#include <array>
#include <csignal>
#include <cstdlib>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include "cli/Settings.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

std::string valueOf(char const* variable) {
    auto const* const value = std::getenv(variable);
    return value != nullptr ? value : "";
}

/// The command of the pager; empty if there is none.
std::string pagerCommand() {
    for (auto const* variable : {"PROJECTCTL_PAGER", "PAGER"}) {
        if (std::getenv(variable) != nullptr) { // an empty one means none
            auto const command = valueOf(variable);
            return command == "cat" ? "" : command;
        }
    }
    return "less";
}

[[noreturn]] void becomePager(std::string const& command, int input) {
    std::signal(SIGPIPE, SIG_DFL);
    std::signal(SIGXFSZ, SIG_DFL);
    dup2(input, STDIN_FILENO);
    setenv("LESS", "FRX", 0); // R: colours reach the terminal
    setenv("LV", "-c", 0);
    execl("/bin/sh", "sh", "-c", command.c_str(), nullptr);
    _exit(127);
}

} // namespace

Pager::Pager() {
    if (!settings().usesPager || !output().isTerminal() || valueOf("TERM") == "dumb") {
        return;
    }
    if (auto const command = pagerCommand(); !command.empty()) {
        start(command);
    }
}

void Pager::start(std::string const& command) {
    std::array<int, 2> ends{};
    if (pipe2(ends.data(), O_CLOEXEC) != 0) {
        return; // the output is shown without a pager
    }
    child_ = fork();
    if (child_ == 0) {
        becomePager(command, ends[0]);
    }
    if (child_ > 0) {
        dup2(ends[1], STDOUT_FILENO);
    }
    close(ends[0]);
    close(ends[1]);
}

Pager::~Pager() {
    if (child_ > 0) {
        dup2(STDERR_FILENO, STDOUT_FILENO); // ends the pager's input
        waitpid(child_, nullptr, 0);
    }
}

} // namespace projectctl

#include "cli/ExternalVerb.hpp"

#include <csignal>

#include <unistd.h>

namespace projectctl {

void callExternalVerb(std::string const& verb, std::vector<std::string> const& arguments) {
    if (verb.find('/') != std::string::npos) {
        return;
    }
    auto program = "projectctl-" + verb;
    auto copies = arguments;
    std::vector<char*> words{program.data()};
    for (auto& argument : copies) {
        words.push_back(argument.data());
    }
    words.push_back(nullptr);
    // The tool ignores these signals; the program begins like any other.
    auto* const pipe = std::signal(SIGPIPE, SIG_DFL);
    auto* const size = std::signal(SIGXFSZ, SIG_DFL);
    execvp(program.c_str(), words.data());
    std::signal(SIGPIPE, pipe);
    std::signal(SIGXFSZ, size);
}

} // namespace projectctl

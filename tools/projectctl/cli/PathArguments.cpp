#include "cli/PathArguments.hpp"

#include <algorithm>
#include <iostream>

#include "cli/ArgumentPaths.hpp"
#include "cli/StandardInput.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"

namespace projectctl {

void PathArguments::declare(CLI::App& app, Completes things) {
    completes(takeTexts(app, "PATH", arguments_), things);
    app.add_flag("-0,--null", isNull_);
    app.final_callback([this] {
        if (arguments_.empty() && !isNull_) {
            throw CLI::RequiredError("PATH");
        }
        if (readsInput()) {
            claimStandardInput();
        }
    });
}

bool PathArguments::readsInput() const {
    return isNull_ || std::ranges::find(arguments_, "-") != arguments_.end();
}

std::vector<Path> PathArguments::read() const {
    ArgumentPaths absolute(workingFolder());
    std::vector<Path> result;
    for (auto const& argument : arguments_) {
        if (argument != "-") {
            result.push_back(absolute.absolute(argument));
        }
    }
    std::cin.sync_with_stdio(false);
    bool const hasInput = readsInput();
    for (std::string line; hasInput && std::getline(std::cin, line, isNull_ ? '\0' : '\n');) {
        result.push_back(absolute.absolute(line));
    }
    return result;
}

Path absolutePath(std::string const& argument) {
    return ArgumentPaths(workingFolder()).absolute(argument);
}

std::vector<Path> absolutePaths(std::vector<std::string> const& arguments) {
    ArgumentPaths paths(workingFolder());
    std::vector<Path> result;
    result.reserve(arguments.size());
    for (auto const& argument : arguments) {
        result.push_back(paths.absolute(argument));
    }
    return result;
}

} // namespace projectctl

#pragma once

#include <filesystem>
#include <map>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "support/RunningProgram.hpp"

namespace project::test {

/// A folder under git. The git command runs without a user's or system's configuration.
class GitFolder {
public:
    using Environment = std::map<std::string, std::string>;

    /// @param environment further variables for git.
    explicit GitFolder(std::filesystem::path folder, Environment environment = {})
        : folder_(std::move(folder)), environment_(std::move(environment)) {
        environment_.insert(
            {{"GIT_CONFIG_GLOBAL", "/dev/null"}, {"GIT_CONFIG_NOSYSTEM", "1"}, {"HOME", "/nowhere"}});
        run({"init", "-q", "-b", "main"});
        run({"config", "gc.auto", "0"});
    }

    /// Runs a git command that may fail.
    ProgramResult tryTo(std::vector<std::string> const& arguments, std::string_view input = {}) const {
        std::vector<std::string> command{"git", "-c", "user.name=Tester", "-c",
                                         "user.email=tester@example.org"};
        command.insert(command.end(), arguments.begin(), arguments.end());
        ProgramSettings settings;
        settings.folder = folder_;
        settings.environment = environment_;
        return runProgram(command, settings, input);
    }

    /// @return the output of git.
    /// @throws std::runtime_error if it fails.
    std::string run(std::vector<std::string> const& arguments, std::string_view input = {}) const {
        auto const done = tryTo(arguments, input);
        if (done.exitCode != 0) {
            throw std::runtime_error("git " + arguments.front() + ": " + done.output + done.errors);
        }
        return done.output;
    }

    void commitAll() const {
        run({"add", "-A"});
        run({"commit", "-q", "-m", "a commit"});
    }

private:
    std::filesystem::path folder_;
    Environment environment_;
};

} // namespace project::test

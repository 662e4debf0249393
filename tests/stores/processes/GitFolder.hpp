#pragma once

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

#include "support/RunningProgram.hpp"

namespace project::test {

/// A folder under git, on which the git command works with nobody's configuration.
class GitFolder {
public:
    explicit GitFolder(std::filesystem::path folder) : folder_(std::move(folder)) {
        run({"init", "-q", "-b", "main"});
        run({"config", "gc.auto", "0"});
    }

    /// @return true when git could do that.
    bool tryTo(std::vector<std::string> const& arguments) const { return result(arguments).exitCode == 0; }

    /// @return what it says.
    /// @throws std::runtime_error when it fails.
    std::string run(std::vector<std::string> const& arguments) const {
        auto const done = result(arguments);
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
    ProgramResult result(std::vector<std::string> const& arguments) const {
        std::vector<std::string> command{"git", "-c", "user.name=Tester", "-c",
                                         "user.email=tester@example.org"};
        command.insert(command.end(), arguments.begin(), arguments.end());
        ProgramSettings settings;
        settings.folder = folder_;
        settings.environment = {
            {"GIT_CONFIG_GLOBAL", "/dev/null"}, {"GIT_CONFIG_NOSYSTEM", "1"}, {"HOME", "/nowhere"}};
        return runProgram(command, settings);
    }

    std::filesystem::path folder_;
};

} // namespace project::test

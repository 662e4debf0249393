#include <chrono>
#include <optional>
#include <string>
#include <thread>
#include <utility>

#include "cli/TextArguments.hpp"
#include "git/PipedProcess.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/StoreError.hpp"
#include "watch/Commands.hpp"
#include "watch/EventLines.hpp"

namespace projectctl {

namespace {

/// The time between two checks of a text for changes. A check costs one system call.
constexpr auto checkInterval = std::chrono::milliseconds(50);

/// How long to wait for the server of a shared project, which announces changes.
constexpr auto longWait = std::chrono::hours(1);

/// The time until the next attempt to reach a server that was unreachable.
constexpr auto pauseAfterError = std::chrono::seconds(1);

/// Prints the changes that other programs make to the project, until it is ended.
class WatchCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("watch");
        app->add_flag("--json", json_);
        takeText(*app, "--exec", command_);
        return app;
    }

    [[noreturn]] int run(OpenProject& project) override {
        project.refresh(); // the current state is not a change
        EventLines const lines(project, json_);
        lines.writeReady();
        output().say(Message("Watching"));
        output().flush();
        for (;;) {
            awaitChange(project);
            passOn();
        }
    }

    bool canRunInBatch() const override { return false; }

private:
    /// Prints the events of one check for changes, or passes them to the command.
    void passOn() const {
        if (!command_ || output().text().empty()) {
            output().flush();
            return;
        }
        auto const events = std::exchange(output().text(), {});
        int const exitCode = runVisibly({"/bin/sh", "-c", *command_}, events);
        if (exitCode != 0) {
            printWarning(exitCode < 0 ? Message("ExecKilled")
                                      : Message("ExecFailed", std::to_string(exitCode)));
        }
    }

    /// A text that cannot be read now may be readable later: another program may be writing it. A server may
    /// be reachable later.
    void awaitChange(OpenProject& project) {
        bool const isText = project.log() == nullptr;
        if (isText) {
            std::this_thread::sleep_for(checkInterval);
        }
        try {
            isText ? project.refresh() : project.watch(longWait);
            lastProblem_.clear();
        } catch (project::stores::StoreError const& error) {
            if (lastProblem_ != error.what()) {
                lastProblem_ = error.what();
                printError(error);
            }
            if (!isText) {
                std::this_thread::sleep_for(pauseAfterError);
            }
        }
    }

    bool json_ = false;
    std::optional<std::string> command_;
    std::string lastProblem_;
};

} // namespace

std::unique_ptr<Command> makeWatchCommand() {
    return std::make_unique<WatchCommand>();
}

} // namespace projectctl

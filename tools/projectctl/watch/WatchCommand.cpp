#include <chrono>
#include <string>
#include <thread>

#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/StoreError.hpp"
#include "watch/Commands.hpp"
#include "watch/EventLines.hpp"

namespace projectctl {

namespace {

/// How long a change stays unseen at most. A look costs one system call.
constexpr auto betweenLooks = std::chrono::milliseconds(50);

/// Tells what others change in the project, for as long as it runs.
class WatchCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(
            "watch", "Tell what others change in the project, a line for each event, until interrupted");
        app->add_flag("--json", json_, "Each line as a JSON object with \"event\" and what it carries");
        return app;
    }

    [[noreturn]] int run(OpenProject& project) override {
        project.refresh(); // what is there already is no change
        EventLines const lines(project, json_);
        output().say("Waiting for changes. Ctrl-C ends it.");
        for (;;) {
            output().flush();
            std::this_thread::sleep_for(betweenLooks);
            look(project);
        }
    }

private:
    /// A text that can't be read now may be whole again later: somebody is at work on it.
    void look(OpenProject& project) {
        try {
            project.refresh();
            lastProblem_.clear();
        } catch (project::stores::StoreError const& error) {
            if (lastProblem_ != error.what()) {
                lastProblem_ = error.what();
                printError(lastProblem_);
            }
        }
    }

    bool json_ = false;
    std::string lastProblem_;
};

} // namespace

std::unique_ptr<Command> makeWatchCommand() {
    return std::make_unique<WatchCommand>();
}

} // namespace projectctl

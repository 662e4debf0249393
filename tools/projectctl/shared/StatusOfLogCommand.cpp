#include <string>

#include "cli/ExitCode.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/HistoryLoss.hpp"
#include "shared/SharedCommands.hpp"

namespace projectctl {

namespace {

using project::stores::HistoryLoss;

/// Shows the state of the log, and takes note of a loss of history.
class StatusOfLogCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override { return tool.add_subcommand("status"); }

    int run(OpenProject& project) override {
        auto& log = requireLog(project);
        auto const status = log.status();
        auto const newest = log.journal().records(std::nullopt, 1);
        show("store", log.journal().name());
        show("version", std::to_string(status.newest.version));
        if (!newest.empty()) {
            show("author", newest.front().author);
            show("host", newest.front().host);
            show("time", shownTime(newest.front().time));
        }
        show("body", std::to_string(status.bodySize) + " bytes");
        show("tail", std::to_string(status.tailSize) + " bytes");
        for (auto const& fault : log.faults()) {
            printError(Message("FaultIn", log.journal().name(), fault.problem));
        }
        auto const loss = log.takeHistoryLoss();
        if (loss) {
            show(*loss);
        }
        return loss && loss->kind == HistoryLoss::Kind::Reset ? exit_code::finding : exit_code::done;
    }

    bool canRunInBatch() const override { return false; }

    bool isListing() const override { return true; }

private:
    static void show(std::string const& name, std::string const& value) {
        output().text() += name + '\t' + value + '\n';
    }

    static void show(HistoryLoss const& loss) {
        if (loss.kind == HistoryLoss::Kind::Reset) {
            printError(Message("ServerResetAccepted", std::to_string(loss.seen), std::to_string(loss.found)));
        } else {
            show("history", Message("HistoryDeleted").text());
        }
    }
};

} // namespace

std::unique_ptr<Command> makeSharedStatusCommand() {
    return std::make_unique<StatusOfLogCommand>();
}

} // namespace projectctl

#include <optional>
#include <string>
#include <vector>

#include "cli/ExitCode.hpp"
#include "output/JsonDocument.hpp"
#include "output/NameForms.hpp"
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
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("status");
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        auto& log = requireLog(project);
        auto const status = log.status();
        auto const newest = log.journal().records(std::nullopt, 1);
        auto const faults = log.faults();
        auto const loss = log.takeHistoryLoss();
        if (isJson_) {
            writeJson(log.journal().name(), status, newest, loss);
        } else {
            writeText(log.journal().name(), status, newest, loss);
        }
        for (auto const& fault : faults) {
            printError(Message("FaultIn", log.journal().name(), fault.problem));
        }
        if (loss && loss->kind == HistoryLoss::Kind::Reset) {
            report(*loss);
        }
        return loss && loss->kind == HistoryLoss::Kind::Reset ? exit_code::finding : exit_code::done;
    }

    bool canRunInBatch() const override { return false; }

    bool isListing() const override { return true; }

private:
    using Status = project::stores::JournalBackend::Status;
    using Records = std::vector<project::stores::JournalRecord>;
    using Loss = std::optional<HistoryLoss>;

    static void writeText(std::string const& store, Status const& status, Records const& newest,
                          Loss const& loss) {
        show("store", store);
        show("version", std::to_string(status.newest.version));
        if (!newest.empty()) {
            show("author", newest.front().author);
            show("host", newest.front().host);
            show("time", shownTime(newest.front().time));
        }
        show("body", std::to_string(status.bodySize) + " bytes");
        show("tail", std::to_string(status.tailSize) + " bytes");
        if (loss && loss->kind == HistoryLoss::Kind::Cleaned) {
            show("history", Message("HistoryDeleted").text());
        }
    }

    static void writeJson(std::string const& store, Status const& status, Records const& newest,
                          Loss const& loss) {
        JsonDocument document(json::sharedStatus);
        document.addText("store", textOf(store));
        document.addNumber("newestVersion", status.newest.version);
        if (!newest.empty()) {
            document.addText("author", textOf(newest.front().author));
            document.addText("host", textOf(newest.front().host));
            document.addText("time", timeInJson(newest.front().time));
        }
        document.addNumber("bodyBytes", status.bodySize);
        document.addNumber("tailBytes", status.tailSize);
        if (loss) {
            bool const isReset = loss->kind == HistoryLoss::Kind::Reset;
            document.addText("history", isReset ? u"reset" : u"cleaned");
            document.addNumber("seenVersion", loss->seen);
        }
        document.finish();
    }

    static void show(std::string const& name, std::string const& value) {
        output().text() += name + '\t' + value + '\n';
    }

    static void report(HistoryLoss const& reset) {
        printError(Message("ServerResetAccepted", std::to_string(reset.seen), std::to_string(reset.found)));
    }

    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeSharedStatusCommand() {
    return std::make_unique<StatusOfLogCommand>();
}

} // namespace projectctl

#include <algorithm>
#include <exception>
#include <optional>
#include <string>
#include <vector>

#include "batch/BatchLines.hpp"
#include "batch/Commands.hpp"
#include "changes/DryRun.hpp"
#include "cli/CodedFailure.hpp"
#include "cli/CommandText.hpp"
#include "cli/Completes.hpp"
#include "cli/StandardInput.hpp"
#include "cli/TextArguments.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectTransaction.hpp"

namespace projectctl {

namespace {

/// Runs several commands as one step. They are commands like any other, and get the project that is open in a
/// transaction. If one of them fails, none has changed anything.
class BatchCommand : public ProjectCommand {
public:
    explicit BatchCommand(CommandList const& commands) : commands_(commands) {}

    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("batch");
        completes(takeText(*app, "FILE", file_), Completes::Files);
        dryRun_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        auto const lines = parseBatch(readFileOrInput(file_), commands_);
        if (project.log() == nullptr) {
            project.warnOfDamage();
        }
        Progress progress(Message("ProgressBatch"));
        ProjectTransaction transaction(project);
        project.warnOfDamageInLog(); // the transaction has read it
        int const result = runAll(lines, project, progress);
        output().flush(); // while a failure can still roll everything back
        if (end(transaction, project)) {
            output().say(Message("BatchDone", lines.size()));
        }
        return result;
    }

    bool canRunInBatch() const override { return false; }

private:
    /// @return `finding` if a command has returned it, otherwise `done`.
    static int runAll(std::vector<BatchLine> const& lines, OpenProject& project, Progress& progress) {
        Output::Silence const silence(output()); // confirmations of changes that are not committed yet
        int result = exit_code::done;
        std::size_t count = 0;
        for (auto const& line : lines) {
            try {
                result = std::max(result, line.command->run(project));
            } catch (std::exception const& error) {
                fail(atLine(line.number, error.what()).text(), error);
            }
            progress.reach(++count);
        }
        return result;
    }

    bool end(ProjectTransaction& transaction, OpenProject& project) const {
        try {
            return dryRun_.end(transaction, project);
        } catch (std::exception const& error) {
            if (exitCodeFor(error) == exit_code::outcomeUnknown) {
                throw;
            }
            fail(error.what(), error);
        }
    }

    /// Says what the error itself does not: that all lines are rolled back.
    [[noreturn]] static void fail(std::string const& text, std::exception const& error) {
        throw CodedFailure(Message("BatchFailed", text), exitCodeFor(error));
    }

    CommandList const& commands_;
    std::optional<std::string> file_;
    DryRun dryRun_;
};

} // namespace

std::unique_ptr<Command> makeBatchCommand(CommandList const& commands) {
    return std::make_unique<BatchCommand>(commands);
}

} // namespace projectctl

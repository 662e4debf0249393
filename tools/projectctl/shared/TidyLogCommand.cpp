#include <chrono>
#include <cstddef>
#include <optional>
#include <string>

#include "output/JsonDocument.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "shared/SharedCommands.hpp"

namespace projectctl {

namespace {

using project::stores::Journal;

/// Appends a body to the log, and deletes old history.
class TidyLogCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("tidy");
        app->add_option("--keep", days_)->check(CLI::Range(0, mostDays));
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        auto& log = requireLog(project);
        project.shield().raise();
        bool const hasNewBody = log.tidy();
        std::optional<std::size_t> deleted;
        if (days_) {
            deleted = log.deleteHistory(firstKept(log.journal()));
        }
        isJson_ ? writeJson(hasNewBody, deleted) : writeText(hasNewBody, deleted);
        return 0;
    }

    bool canRunInBatch() const override { return false; }

private:
    static void writeJson(bool hasNewBody, std::optional<std::size_t> const& deleted) {
        JsonDocument document(json::sharedTidy);
        document.addFlag("newBody", hasNewBody);
        if (deleted) {
            document.addNumber("deletedEntries", *deleted);
        }
        document.finish();
    }

    static void writeText(bool hasNewBody, std::optional<std::size_t> const& deleted) {
        output().say(Message(hasNewBody ? "LogTidied" : "LogIsTidy"));
        if (deleted) {
            output().text() += Message("LogEntriesDeleted", *deleted).text() + '\n';
        }
    }

    static constexpr int mostDays = 36500;
    static constexpr std::size_t page = 1000;

    /// The oldest version that is young enough; with none, the newest one.
    std::uint64_t firstKept(Journal& journal) const {
        auto const limit = std::chrono::system_clock::now() - std::chrono::hours(24) * *days_;
        std::optional<std::uint64_t> oldest;
        for (;;) {
            auto const records = journal.records(oldest, page);
            for (auto const& record : records) {
                if (oldest && record.time < limit) {
                    return *oldest;
                }
                oldest = record.position.version;
            }
            if (records.size() < page) {
                return oldest.value_or(0);
            }
        }
    }

    std::optional<int> days_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeSharedTidyCommand() {
    return std::make_unique<TidyLogCommand>();
}

} // namespace projectctl

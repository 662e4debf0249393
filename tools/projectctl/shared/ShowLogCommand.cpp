#include <algorithm>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "shared/SharedCommands.hpp"

namespace projectctl {

namespace {

using project::stores::Journal;
using project::stores::JournalRecord;

/// Shows who wrote what and when.
class ShowLogCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("log");
        app->add_option("--count", count_)->check(CLI::Range(1, most));
        app->add_flag("--lines", showsLines_);
        return app;
    }

    int run(OpenProject& project) override {
        auto& journal = requireLog(project).journal();
        auto const records = journal.records(std::nullopt, static_cast<std::size_t>(count_));
        auto const lines = showsLines_ && !records.empty() ? linesSince(journal, records) : Lines();
        for (auto const& record : records) {
            output().text() += std::to_string(record.position.version) + '\t' + shownTime(record.time) +
                               '\t' + record.author + '\t' + record.host + '\t' +
                               (record.isBody ? "body" : "batch") + '\n';
            auto const found = lines.find(record.position.version);
            if (found != lines.end()) {
                showIndented(found->second);
            }
            output().flushWhenLarge();
        }
        return 0;
    }

    bool canRunInBatch() const override { return false; }

    bool isListing() const override { return true; }

private:
    using Lines = std::map<std::uint64_t, std::string>;

    static constexpr int most = 1'000'000;

    /// The lines by version. A look leaves out those of the version that it begins with.
    static Lines linesSince(Journal& journal, std::vector<JournalRecord> const& records) {
        auto const oldest = records.back().position.version;
        Lines lines;
        for (auto& entry : journal.look(std::max<std::uint64_t>(oldest, 2) - 1).entries) {
            lines.emplace(entry.position.version, std::move(entry.lines));
        }
        return lines;
    }

    static void showIndented(std::string const& lines) {
        for (std::size_t begin = 0; begin < lines.size();) {
            auto const end = std::min(lines.find('\n', begin), lines.size());
            output().text() += "    " + lines.substr(begin, end - begin) + '\n';
            begin = end + 1;
        }
    }

    int count_ = 20;
    bool showsLines_ = false;
};

} // namespace

std::unique_ptr<Command> makeSharedLogCommand() {
    return std::make_unique<ShowLogCommand>();
}

} // namespace projectctl

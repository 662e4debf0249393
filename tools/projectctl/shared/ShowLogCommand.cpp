#include <algorithm>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "output/JsonRows.hpp"
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
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        auto& journal = requireLog(project).journal();
        auto const records = journal.records(std::nullopt, static_cast<std::size_t>(count_));
        auto const lines = showsLines_ && !records.empty() ? linesSince(journal, records) : Lines();
        isJson_ ? writeJson(records, lines) : writeText(records, lines);
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

    static char const* kindOf(JournalRecord const& record) { return record.isBody ? "body" : "batch"; }

    static void writeText(std::vector<JournalRecord> const& records, Lines const& lines) {
        for (auto const& record : records) {
            output().text() += std::to_string(record.position.version) + '\t' + shownTime(record.time) +
                               '\t' + record.author + '\t' + record.host + '\t' + kindOf(record) + '\n';
            auto const found = lines.find(record.position.version);
            if (found != lines.end()) {
                for (auto const& line : linesIn(found->second)) {
                    output().text() += "    " + line + '\n';
                }
            }
            output().flushWhenLarge();
        }
    }

    static void writeJson(std::vector<JournalRecord> const& records, Lines const& lines) {
        JsonRows rows(json::sharedLog, "entries");
        for (auto const& record : records) {
            rows.begin();
            rows.addNumber("version", record.position.version);
            rows.addText("time", timeInJson(record.time));
            rows.addText("author", textOf(record.author));
            rows.addText("host", textOf(record.host));
            rows.addText("kind", textOf(kindOf(record)));
            auto const found = lines.find(record.position.version);
            if (found != lines.end()) {
                auto const texts = linesIn(found->second);
                std::vector<std::u16string> converted(texts.size());
                std::ranges::transform(texts, converted.begin(), textOf);
                rows.addList("lines", converted);
            }
        }
        rows.finish();
    }

    static std::vector<std::string> linesIn(std::string const& text) {
        std::vector<std::string> result;
        for (std::size_t begin = 0; begin < text.size();) {
            auto const end = std::min(text.find('\n', begin), text.size());
            result.push_back(text.substr(begin, end - begin));
            begin = end + 1;
        }
        return result;
    }

    int count_ = 20;
    bool showsLines_ = false;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeSharedLogCommand() {
    return std::make_unique<ShowLogCommand>();
}

} // namespace projectctl

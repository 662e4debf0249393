#include <algorithm>
#include <optional>
#include <string>
#include <system_error>
#include <utility>

#include "cli/Completes.hpp"
#include "cli/PathArguments.hpp"
#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "git/PipedProcess.hpp"
#include "history/GitProject.hpp"
#include "output/Failure.hpp"
#include "output/JsonDocument.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "report/Commands.hpp"
#include "report/Page.hpp"
#include "report/PageFile.hpp"
#include "report/ReportData.hpp"

namespace projectctl {

namespace {

/// Writes a page about the project: one HTML file that needs no network.
class ReportCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("report");
        completes(takeText(*app, "--output", output_), Completes::Files);
        takeText(*app, "--compare", compared_);
        app->add_flag("--open", isOpened_);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        auto const file = absolutePath(output_.value_or("project-report.html"));
        project.warnOfDamage();
        auto const data = collect(project, file);
        auto const page = assemblePage(jsonOf(data));
        replaceFile(file, page);
        isJson_ ? writeJson(data, file, page.size()) : confirm(data, file, page.size());
        if (isOpened_) {
            open(file);
        }
        return 0;
    }

    /// False: the page shows the state that others can read.
    bool canRunInBatch() const override { return false; }

private:
    ReportData collect(OpenProject& project, Path const& file) const {
        ReportData data;
        data.root = project.root();
        Progress progress(Message("ProgressReportDefinition"));
        data.definition = readDefinition(project);
        progress.begin(Message("ProgressReportFiles"));
        data.measures = measureFiles(data.root, data.definition.entries, progress);
        progress.begin(Message("ProgressReportChecks"));
        data.findings = collectFindings(project, file, progress);
        data.projects = ReferenceGraph(data.root).nodes();
        progress.begin(Message("ProgressReportHistory"));
        readGit(project, data, progress);
        return data;
    }

    void readGit(OpenProject& project, ReportData& data, Progress& progress) const {
        bool const hasText = project.log() == nullptr && settings().sourceControl;
        auto const inGit = hasText ? GitProject::at(data.root) : std::nullopt;
        if (inGit) {
            data.lastChange = lastChangeOf(*inGit);
            data.history = readHistory(*inGit, progress);
        }
        if (compared_) {
            if (!inGit) {
                throw Failure(Message("ReportCannotCompare"));
            }
            data.comparison = compareWith(*compared_, *inGit, data.definition);
        }
    }

    static std::size_t countFiles(ReportData const& data) {
        return static_cast<std::size_t>(
            std::ranges::count(data.definition.entries, Kind::File, &Definition::Entry::kind));
    }

    static void confirm(ReportData const& data, Path const& file, std::size_t size) {
        output().say(Message("ReportWritten", file, countFiles(data), size));
    }

    static void writeJson(ReportData const& data, Path const& file, std::size_t size) {
        std::size_t const files = countFiles(data);
        JsonDocument document(json::report);
        document.addText("path", file.native());
        document.addNumber("bytes", size);
        document.addNumber("files", files);
        document.addNumber("folders", data.definition.entries.size() - files);
        document.addNumber("findings", data.findings.findings.size() + data.findings.omitted);
        document.finish();
    }

    /// Lets the desktop choose the browser. It does not wait for the browser to end.
    static void open(Path const& file) {
        try {
            if (runVisibly({"xdg-open", bytesOf(file.native())}, {}) != 0) {
                throw Failure(Message("ReportNotOpened", file));
            }
        } catch (std::system_error const&) {
            throw Failure(Message("ReportNotOpened", file));
        }
    }

    std::optional<std::string> output_;
    std::optional<std::string> compared_;
    bool isOpened_ = false;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeReportCommand() {
    return std::make_unique<ReportCommand>();
}

} // namespace projectctl

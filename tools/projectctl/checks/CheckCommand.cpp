#include <algorithm>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "checks/Commands.hpp"
#include "checks/DefinitionFindings.hpp"
#include "checks/FindingForms.hpp"
#include "cli/CodedFailure.hpp"
#include "cli/ExitCode.hpp"
#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "output/Colors.hpp"
#include "output/JsonDocument.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/PersonalText.hpp"

namespace projectctl {

namespace {

using project::stores::Fault;

/// Reports all faults of the project's text, of its definition and of the merge set-up.
class CheckCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("check");
        app->add_flag("--repair", repair_);
        auto* const form = takeText(*app, "--format", format_);
        app->add_flag("--json", isJson_)->excludes(form);
        return app;
    }

    int run(OpenProject& project) override {
        auto const form = chosenForm();
        if (repair_) {
            repair(project);
        }
        Progress progress(Message("ProgressCheck"));
        auto const faults = faultsOfDefinition(project);
        auto const& root = project.root();
        auto const found =
            findingsOf(faults, project, isJson_ ? ShownPaths::fromRoot(root) : ShownPaths(root));
        if (isJson_) {
            writeJson(found);
        } else if (form == FindingForm::Text) {
            writeText(found, project.definition());
        } else {
            write(found, form, shownDefinition(project));
        }
        auto const count = countFaults(found);
        output().say(Message(count == 0                       ? "NoFaults"
                             : areAll(found, &isAboutSetup)   ? "AdviceSetup"
                             : areAll(found, &isAboutFolders) ? "AdviceSync"
                                                              : adviceFor(faults)));
        return count == 0 ? exit_code::done : exit_code::finding;
    }

    bool canRunInBatch() const override { return !repair_; }

private:
    FindingForm chosenForm() const {
        if (!format_ || *format_ == "text") {
            return FindingForm::Text;
        }
        if (*format_ != "gcc" && *format_ != "github") {
            throw WrongUse(Message("FormatUnknown", *format_));
        }
        return *format_ == "gcc" ? FindingForm::Gcc : FindingForm::GitHub;
    }

    static bool isAboutSetup(Finding const& finding) { return finding.code.starts_with("merge-"); }

    static bool isAboutFolders(Finding const& finding) { return finding.code.starts_with("sync-"); }

    /// Whether all faults are about a subject.
    static bool areAll(Findings const& findings, bool (*isAbout)(Finding const&)) {
        return std::ranges::all_of(
            findings, [isAbout](Finding const& finding) { return !finding.isFault() || isAbout(finding); });
    }

    /// Faults of the text itself are shown with their lines.
    static void writeText(Findings const& findings, std::string const& file) {
        for (auto const& finding : findings) {
            bool const hasLine = finding.line > 0 && !finding.address;
            auto const place = file + (hasLine ? ':' + std::to_string(finding.line) : std::string()) + ": ";
            auto const mark = finding.isFault() ? std::string() : Message("NoteMark").text() + ": ";
            bool const isInText = !isAboutSetup(finding) && !isAboutFolders(finding);
            auto const begin = withoutControls((isInText ? place : std::string()) + mark, false);
            output().text() += colored(finding.isFault() ? Color::Fault : Color::Note, begin) +
                               withoutControls(finding.text, false) + '\n';
        }
    }

    static std::string shownDefinition(OpenProject& project) {
        if (project.log() != nullptr) {
            return project.definition();
        }
        auto const text = project::stores::TextBackend::textPath(project.root());
        return bytesOf(ShownPaths(project.root()).ofAbsolute(text));
    }

    void writeJson(Findings const& findings) const {
        JsonDocument document(json::check);
        addFindings(document, findings);
        if (!aside_.empty()) {
            document.addText("repaired", textOf(aside_));
        }
        document.finish();
    }

    void repair(OpenProject& project) {
        project.shield().raise();
        if (auto* const log = project.log()) {
            repair(*log);
        } else if (std::string const aside = project.text().repair(); !aside.empty()) {
            project.stageLater();
            aside_ = Message("LinesAside", project.storeFile(aside)).text();
        }
        if (auto const aside = project.access().personalText().repair(); !aside.empty()) {
            auto const file = project::stores::PersonalText::folder(project.root()) / textOf(aside);
            aside_ += (aside_.empty() ? "" : "; ") + Message("PersonalRepaired", file).text();
        }
        if (!aside_.empty() && !isJson_) {
            report(aside_);
        }
    }

    void repair(project::stores::JournalBackend& log) {
        if (auto const aside = log.repair()) {
            aside_ = Message(aside->isNothingLost ? "EntriesAsideNothingLost" : "EntriesAside",
                             std::to_string(aside->first), std::to_string(aside->last))
                         .text();
        }
    }

    static char const* adviceFor(std::vector<Fault> const& faults) {
        auto const has = [&faults](Fault::Kind kind) {
            return std::ranges::find(faults, kind, &Fault::kind) != faults.end();
        };
        if (has(Fault::Kind::Conflict)) {
            return "AdviceResolve";
        }
        if (has(Fault::Kind::Damage)) {
            return "AdviceRepair";
        }
        if (has(Fault::Kind::Irregular) || has(Fault::Kind::TornTail)) {
            return "AdviceTidy";
        }
        return "AdviceEdit";
    }

    /// Writes one line. Control characters are replaced by C escapes.
    static void report(std::string const& text) { output().text() += withoutControls(text, false) + '\n'; }

    bool repair_ = false;
    bool isJson_ = false;
    std::optional<std::string> format_;
    std::string aside_; ///< what --repair has done
};

} // namespace

std::unique_ptr<Command> makeCheckCommand() {
    return std::make_unique<CheckCommand>();
}

} // namespace projectctl

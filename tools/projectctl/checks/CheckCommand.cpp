#include <algorithm>
#include <string>
#include <vector>

#include "checks/Commands.hpp"
#include "checks/MergeSetupCheck.hpp"
#include "checks/TreeCheck.hpp"
#include "cli/ExitCode.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::stores::Fault;

/// Reports all faults of the project's text, of its definition and of the merge set-up.
class CheckCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("check");
        app->add_flag("--repair", repair_);
        return app;
    }

    int run(OpenProject& project) override {
        if (repair_) {
            repair(project);
        }
        Progress progress("Checking the project");
        std::size_t faults = 0;
        std::string const file = project.definition();
        auto const faultsOfDefinition = project.log() == nullptr ? project.faults() : project.log()->check();
        for (auto const& fault : faultsOfDefinition) {
            ++faults;
            std::string const line = fault.line > 0 ? ':' + std::to_string(fault.line) : std::string();
            report(file + line + ": " + fault.problem);
        }
        for (auto const& finding : TreeCheck(project).run()) {
            bool const isFault = finding.weight == Finding::Weight::Fault;
            faults += isFault ? 1 : 0;
            report(file + (isFault ? ": " : ": note: ") + finding.text);
        }
        Findings ofSetup;
        if (project.log() == nullptr) { // git merges no log
            checkMergeSetup(project.root(), ofSetup);
        }
        std::size_t const faultsOfProject = faults;
        for (auto const& finding : ofSetup) {
            bool const isFault = finding.weight == Finding::Weight::Fault;
            faults += isFault ? 1 : 0;
            report((isFault ? "" : "note: ") + finding.text);
        }
        output().say(faults == 0            ? "The project has no faults."
                     : faultsOfProject == 0 ? "'projectctl setup' configures the merge driver."
                                            : adviceFor(faultsOfDefinition));
        return faults == 0 ? exit_code::done : exit_code::finding;
    }

    bool canRunInBatch() const override { return !repair_; }

private:
    static void repair(OpenProject& project) {
        project.shield().raise();
        if (auto* const log = project.log()) {
            repair(*log);
            return;
        }
        std::string const aside = project.text().repair();
        if (!aside.empty()) {
            project.stageLater();
            report("the damaged lines are now in " + project.storeFile(aside));
        }
    }

    static void repair(project::stores::JournalBackend& log) {
        if (auto const aside = log.repair()) {
            report("the damaged entries " + std::to_string(aside->first) + " to " +
                   std::to_string(aside->last) + " of the log are set aside" +
                   (aside->isNothingLost ? ", and nothing is lost" : "; what could be read is kept"));
        }
    }

    static char const* adviceFor(std::vector<Fault> const& faults) {
        auto const has = [&faults](Fault::Kind kind) {
            return std::ranges::find(faults, kind, &Fault::kind) != faults.end();
        };
        if (has(Fault::Kind::Conflict)) {
            return "'projectctl resolve' resolves the conflicts.";
        }
        if (has(Fault::Kind::Damage)) {
            return "'projectctl check --repair' sets damaged lines aside.";
        }
        if (has(Fault::Kind::Irregular) || has(Fault::Kind::TornTail)) {
            return "'projectctl tidy' corrects irregular lines and torn tails.";
        }
        return "Correct these lines in an editor.";
    }

    /// Writes one line. Control characters are replaced by C escapes.
    static void report(std::string const& text) { output().text() += withoutControls(text, false) + '\n'; }

    bool repair_ = false;
};

} // namespace

std::unique_ptr<Command> makeCheckCommand() {
    return std::make_unique<CheckCommand>();
}

} // namespace projectctl

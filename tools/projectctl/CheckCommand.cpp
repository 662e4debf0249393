#include <string>

#include "Commands.hpp"
#include "NameForms.hpp"
#include "OpenProject.hpp"
#include "Output.hpp"
#include "Progress.hpp"
#include "TreeCheck.hpp"

namespace projectctl {

namespace {

/// Looks for faults in the project's text and in what it says, and tells all of them.
class CheckCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("check", "Look through the whole project for faults");
        app->add_flag("--repair", repair_,
                      "First set damaged lines aside into a file of their own, and write the rest anew");
        return app;
    }

    int run() override {
        auto project = OpenProject::ofWorkingFolder();
        if (repair_) {
            repair(project);
        }
        Progress progress("Looking through the project");
        std::size_t faults = 0;
        auto const file = project.textFile();
        for (auto const& fault : project.text().check()) {
            ++faults;
            tell(file + ':' + std::to_string(fault.line) + ": " + fault.problem);
        }
        for (auto const& finding : TreeCheck(project.store(), project.files()).run()) {
            faults += finding.isFault ? 1 : 0;
            tell(file + (finding.isFault ? ": " : ": note: ") + finding.text);
        }
        if (faults == 0) {
            output().say("The project has no faults.");
        }
        return faults == 0 ? 0 : 1;
    }

private:
    static void repair(OpenProject& project) {
        project.shield().raise();
        auto const aside = project.text().repair();
        if (!aside.empty()) {
            tell("what was damaged stands in " + project.storeFile(aside) + " now");
        }
    }

    /// One line, whatever is in it.
    static void tell(std::string const& text) { output().text() += withoutControls(text, false) + '\n'; }

    bool repair_ = false;
};

} // namespace

std::unique_ptr<Command> makeCheckCommand() {
    return std::make_unique<CheckCommand>();
}

} // namespace projectctl

#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Writes the project's text in its one canonical form, so that a commit holds nothing but what changed.
class TidyCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        return tool.add_subcommand(
            "tidy", "Bring the project's text into its canonical form, to be done before it is committed");
    }

    int run(OpenProject& project) override {
        project.shield().raise();
        if (project.text().tidy()) {
            project.stageLater();
            output().say("The project's text is tidy now.");
        } else {
            output().say("The project's text is tidy.");
        }
        return 0;
    }
};

} // namespace

std::unique_ptr<Command> makeTidyCommand() {
    return std::make_unique<TidyCommand>();
}

} // namespace projectctl

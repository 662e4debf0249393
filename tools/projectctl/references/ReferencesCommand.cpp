#include "cli/ExitCode.hpp"
#include "cli/WorkingFolder.hpp"
#include "project/OpenProject.hpp"
#include "project/ProjectFolder.hpp"
#include "references/Commands.hpp"
#include "references/GraphForms.hpp"
#include "references/ReferenceGraph.hpp"

namespace projectctl {

namespace {

/// Follows the references to other projects, beginning with this one.
class ReferencesCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("references");
        app->add_flag("--graph", isGraph_)->required();
        auto* const json = app->add_flag("--json", isJson_);
        app->add_flag("--dot", isDot_)->excludes(json);
        return app;
    }

    int run() override {
        ReferenceGraph const graph(findProjectRoot(workingFolder()));
        if (isJson_) {
            writeJson(graph);
        } else if (isDot_) {
            writeDot(graph);
        } else {
            writeTree(graph);
        }
        return graph.isSound() ? exit_code::done : exit_code::finding;
    }

    bool isListing() const override { return true; }

private:
    bool isGraph_ = false; ///< required: the only form so far
    bool isJson_ = false;
    bool isDot_ = false;
};

} // namespace

std::unique_ptr<Command> makeReferencesCommand() {
    return std::make_unique<ReferencesCommand>();
}

} // namespace projectctl

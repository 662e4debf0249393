#include "cli/WorkingFolder.hpp"
#include "project/OpenProject.hpp"
#include "project/ProjectFolder.hpp"
#include "references/Commands.hpp"
#include "references/GraphForms.hpp"
#include "references/ReferenceGraph.hpp"

namespace projectctl {

namespace {

/// Follows the references to other projects.
class ReferencesCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(
            "references",
            "Follow the references to other projects, from this one on; fails when one is missing "
            "or cannot be read, and when projects reference each other in a circle");
        app->add_flag("--graph", graph_, "Show all projects that are reached, with what each references")
            ->required();
        auto* const json = app->add_flag("--json", json_, "As a JSON object instead of a tree");
        app->add_flag("--dot", dot_, "As text for Graphviz instead of a tree")->excludes(json);
        return app;
    }

    int run() override {
        ReferenceGraph const graph(findProjectRoot(workingFolder()));
        if (json_) {
            writeJson(graph);
        } else if (dot_) {
            writeDot(graph);
        } else {
            writeTree(graph);
        }
        return graph.isSound() ? 0 : 1;
    }

private:
    bool graph_ = false; ///< the only thing to do yet, and always asked for
    bool json_ = false;
    bool dot_ = false;
};

} // namespace

std::unique_ptr<Command> makeReferencesCommand() {
    return std::make_unique<ReferencesCommand>();
}

} // namespace projectctl

#include <optional>
#include <string>
#include <vector>

#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "files/Commands.hpp"
#include "files/MoveFailure.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Moves files and folders on disk, in the project and in git's index, in one step.
class MoveCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("move");
        completes(takeTexts(*app, "SOURCE", sources_), Completes::ProjectPaths)->required();
        auto* const last =
            completes(takeText(*app, "DESTINATION", destination_), Completes::Files)->required();
        // The parser gives all arguments to the first list, and would miss the last one.
        app->preparse_callback([last](std::size_t) { last->required(false); });
        app->final_callback([this] {
            if (!destination_ && sources_.size() < 2) {
                throw CLI::RequiredError("DESTINATION");
            }
            if (!destination_) {
                destination_ = sources_.back();
                sources_.pop_back();
            }
        });
        return app;
    }

    int run(OpenProject& project) override {
        auto const sources = absolutePaths(sources_);
        for (auto const& source : sources) {
            project.requireInProject(source);
        }
        Path destination = absolutePath(*destination_);
        if (destination_->ends_with('/')) {
            destination = destination.native() + u'/'; // it must be a folder
        }
        try {
            auto const moves = project.move(sources, destination);
            output().say(Message("Moved", moves.size()));
        } catch (project::session::MoveError const& error) {
            throw failureOf(error);
        }
        return 0;
    }

private:
    std::vector<std::string> sources_;
    std::optional<std::string> destination_;
};

} // namespace

std::unique_ptr<Command> makeMoveCommand() {
    return std::make_unique<MoveCommand>();
}

} // namespace projectctl

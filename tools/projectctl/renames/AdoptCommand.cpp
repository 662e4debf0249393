#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

#include "changes/DryRun.hpp"
#include "cli/CodedFailure.hpp"
#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "files/MoveFailure.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "renames/Commands.hpp"
#include "renames/FindRenames.hpp"
#include "renames/SimilarityOption.hpp"

namespace projectctl {

namespace {

using project::session::Move;

/// Lets the project follow files that other programs have renamed, in one step.
class AdoptCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("adopt");
        completes(takeTexts(*app, "PATH", pairs_), Completes::Files);
        declareSimilarity(*app, similarity_)->excludes(app->get_option("PATH"));
        app->add_flag("--guesses", adoptsGuesses_)->excludes(app->get_option("PATH"));
        dryRun_.declare(*app);
        app->final_callback([this] {
            if (pairs_.size() % 2 != 0) {
                throw WrongUse(Message("PairIncomplete", pairs_.back()));
            }
        });
        return app;
    }

    int run(OpenProject& project) override {
        ProjectTransaction transaction(project);
        auto const moves = pairs_.empty() ? found(project) : given(project);
        try {
            project.adopt(moves.ofFiles);
        } catch (project::session::MoveError const& error) {
            throw failureOf(error);
        }
        followPersonal(project, moves.ofHidden);
        project.changedFiles().listed += moves.ofFiles.size();
        std::vector<Path> files;
        std::ranges::transform(moves.ofFiles, std::back_inserter(files), &Move::to);
        project.stageReturnedLater(files);
        if (dryRun_.end(transaction, project)) {
            output().say(Message("Adopted", moves.ofFiles.size() + moves.ofHidden.size()));
        }
        return 0;
    }

private:
    struct Moves {
        std::vector<Move> ofFiles;
        std::vector<Move> ofHidden; ///< of files that left the project, and whose personal labels are hidden
    };

    Moves given(OpenProject& project) const {
        auto const paths = absolutePaths(pairs_);
        auto const hidden = project.personal().hiddenFiles();
        Moves result;
        for (std::size_t index = 0; index < paths.size(); index += 2) {
            Move const move{paths[index], paths[index + 1]};
            if (std::ranges::find(hidden, move.from) != hidden.end()) {
                result.ofHidden.push_back(move);
            } else {
                project.requireInProject(move.from);
                result.ofFiles.push_back(move);
            }
        }
        return result;
    }

    static void followPersonal(OpenProject& project, std::vector<Move> const& moves) {
        if (moves.empty()) {
            return;
        }
        auto const followed = project.personal().followHidden(moves);
        for (auto const& move : moves) {
            if (std::ranges::find(followed, move) == followed.end()) {
                ShownPaths shown(project.root());
                std::u16string const from(shown.ofAbsolute(move.from));
                throw Failure(Message("PersonalNotFollowed", from, shown.ofAbsolute(move.to)));
            }
        }
    }

    static Move absolute(Rename const& rename, OpenProject const& project) {
        return {project.root() / Path(rename.from), project.root() / Path(rename.to)};
    }

    Moves found(OpenProject& project) const {
        Progress const progress(Message("ProgressRenames"));
        auto const renames = findRenames(project, similarity_);
        Moves result;
        std::size_t guesses = 0;
        for (auto const& rename : renames.pairs) {
            if (rename.evidence == Rename::Evidence::Name && !adoptsGuesses_) {
                ++guesses;
            } else {
                result.ofFiles.push_back(absolute(rename, project));
            }
        }
        for (auto const& rename : renames.personal) {
            result.ofHidden.push_back(absolute(rename, project));
        }
        if (guesses > 0) {
            printError(Message("GuessesLeft", guesses));
        }
        if (!renames.ambiguous.empty()) {
            printError(Message("AmbiguousLeft", renames.ambiguous.size()));
        }
        return result;
    }

    std::vector<std::string> pairs_;
    int similarity_ = usualSimilarity;
    bool adoptsGuesses_ = false;
    DryRun dryRun_;
};

} // namespace

std::unique_ptr<Command> makeAdoptCommand() {
    return std::make_unique<AdoptCommand>();
}

} // namespace projectctl

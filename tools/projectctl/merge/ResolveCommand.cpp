#include <cstddef>
#include <iostream>
#include <optional>
#include <string>
#include <system_error>
#include <vector>

#include <unistd.h>

#include "git/GitCommand.hpp"
#include "git/TextInRepository.hpp"
#include "merge/Commands.hpp"
#include "merge/ConflictWords.hpp"
#include "merge/RenamesOfMerge.hpp"
#include "output/Failure.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/TextMerge.hpp"

namespace projectctl {

namespace {

using project::stores::MergeConflict;
using project::stores::MergeSide;
using project::stores::TextMerge;

constexpr char const* textInRoot = "./.projectdata/project.jsonl"; // for git, from the root

/// Resolves the conflicts of a merge, from the versions in git's index.
class ResolveCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("resolve");
        auto* const ours = app->add_flag("--ours", ours_);
        app->add_flag("--theirs", theirs_)->excludes(ours);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        if (project.log() != nullptr) {
            throw Failure(Message("ResolveOfShared"));
        }
        auto const merge = mergeAgain(project.root());
        auto const choices = choose(merge.conflicts());
        project.shield().raise();
        project.text().resolve(merge.text(choices));
        stage(project.root());
        if (isJson_) {
            writeJson(merge.conflicts(), choices);
        }
        output().say(Message("Resolved"));
        return 0;
    }

    bool canRunInBatch() const override { return false; }

private:
    static void writeJson(std::vector<MergeConflict> const& conflicts,
                          std::vector<MergeSide> const& choices) {
        JsonRows rows(json::resolve, "conflicts");
        for (std::size_t index = 0; index < conflicts.size(); ++index) {
            rows.begin();
            rows.addText("side", choices[index] == MergeSide::Ours ? u"ours" : u"theirs");
            rows.addText("text", textOf(inWords(conflicts[index])));
        }
        rows.finish();
    }

    static TextMerge mergeAgain(Path const& root) {
        constexpr int base = 1;
        constexpr int ours = 2;
        constexpr int theirs = 3;
        auto const our = version(root, ours);
        auto const their = version(root, theirs);
        if (!our || !their) {
            throw Failure(Message("NothingToResolve"));
        }
        auto const prefix = firstLine(git(root, {"rev-parse", "--show-prefix"}));
        auto const renames =
            renamesOfMerge(root, prefix + textBelowRoot,
                           {versionId(root, base), versionId(root, ours), versionId(root, theirs)});
        return project::stores::mergeTexts(version(root, base).value_or(std::string()), *our, *their,
                                           renames.ours, renames.theirs);
    }

    /// The text in one stage of git's index; empty if there is none.
    static std::optional<std::string> version(Path const& root, int stage) {
        auto result = git(root, {"cat-file", "blob", inStage(stage)});
        return result.exitCode == 0 ? std::optional(std::move(result.output)) : std::nullopt;
    }

    static std::string versionId(Path const& root, int stage) {
        return firstLine(git(root, {"rev-parse", "-q", "--verify", inStage(stage)}));
    }

    static std::string inStage(int stage) { return ":" + std::to_string(stage) + ':' + textInRoot; }

    static std::string firstLine(ProcessResult const& result) {
        return result.output.substr(0, result.output.find('\n'));
    }

    static void stage(Path const& root) {
        auto const result = git(root, {"add", "--", textInRoot});
        if (result.exitCode != 0) {
            throw Failure(Message("ResolvedNotStaged", result.errors.substr(0, result.errors.find('\n'))));
        }
    }

    static ProcessResult git(Path const& root, std::vector<std::string> const& arguments) {
        try {
            return runGit(root, arguments);
        } catch (std::system_error const& error) {
            throw Failure(Message("VersionsUnreadable", error.what()));
        }
    }

    std::vector<MergeSide> choose(std::vector<MergeConflict> const& conflicts) const {
        if (ours_ || theirs_) {
            return {conflicts.size(), ours_ ? MergeSide::Ours : MergeSide::Theirs};
        }
        bool const canAsk = !isJson_ && output().isTerminal() && isatty(STDIN_FILENO) == 1;
        std::vector<MergeSide> result;
        result.reserve(conflicts.size());
        for (auto const& conflict : conflicts) {
            if (canAsk) {
                result.push_back(ask(conflict, result.size() + 1, conflicts.size()));
            } else {
                printError(Message("Conflict", inWords(conflict)));
            }
        }
        if (result.size() < conflicts.size()) {
            throw Failure(Message("ConflictsLeft", conflicts.size()));
        }
        return result;
    }

    static MergeSide ask(MergeConflict const& conflict, std::size_t number, std::size_t total) {
        auto const question = Message("ConflictOfTotal", number, total, inWords(conflict)).text();
        output().text() += withoutControls(question, false) + '\n';
        for (std::string answer;;) {
            output().text() += Message("WhichSide").text() + ' ';
            output().flush();
            if (!std::getline(std::cin, answer) || answer == "q") {
                throw Failure(Message("NothingChanged"));
            }
            if (answer == "o" || answer == "ours") {
                return MergeSide::Ours;
            }
            if (answer == "t" || answer == "theirs") {
                return MergeSide::Theirs;
            }
        }
    }

    bool ours_ = false;
    bool theirs_ = false;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeResolveCommand() {
    return std::make_unique<ResolveCommand>();
}

} // namespace projectctl

#include <optional>
#include <set>
#include <string>
#include <variant>
#include <vector>

#include "changes/DryRun.hpp"
#include "cli/CodedFailure.hpp"
#include "cli/Completes.hpp"
#include "cli/PathArguments.hpp"
#include "cli/Settings.hpp"
#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "files/DiskFolder.hpp"
#include "files/MoveFailure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"
#include "sync/Commands.hpp"
#include "sync/Losses.hpp"
#include "sync/PlanJson.hpp"
#include "sync/RuleForms.hpp"

namespace projectctl {

namespace {

using project::session::SyncPlan;
using project::session::SyncRule;
using ZEPHRA::project::management::SyncFolderMissing;

/// Brings the folders that have rules up to date, and sets, removes and lists these rules.
class SyncCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("sync");
        auto* const rule = completes(takeText(*app, "--rule", folder_), Completes::Folders);
        for (auto* const patterns :
             {takeTexts(*app, "--include", included_), takeTexts(*app, "--exclude", excluded_)}) {
            patterns->allow_extra_args(false)->needs(rule);
        }
        app->add_flag("--no-gitignore", ignoresNothing_)->needs(rule);
        auto* const removed = completes(takeText(*app, "--remove-rule", removed_), Completes::Folders);
        auto* const force = app->add_flag("--force", isForced_);
        auto* const rules = app->add_flag("--rules", listsRules_);
        rule->excludes(removed)->excludes(rules)->excludes(force);
        removed->excludes(rules)->excludes(force);
        rules->excludes(force);
        dryRun_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        if (listsRules_) {
            dryRun_.isJson() ? writeRulesAsJson(project) : writeRules(project);
        } else if (folder_) {
            setRule(project);
        } else if (removed_) {
            removeRule(project);
        } else {
            synchronise(project);
        }
        return exit_code::done;
    }

private:
    void setRule(OpenProject& project) const {
        SyncRule const rule{absolutePath(*folder_), patternsOf(included_), patternsOf(excluded_),
                            !ignoresNothing_};
        ProjectTransaction transaction(project);
        project.session().setSyncRule(rule);
        if (dryRun_.end(transaction, project)) {
            auto const plan = project.session().planSync();
            output().say(Message("SyncRuleSet", plan.added.size(), plan.removed.size()));
        }
    }

    void removeRule(OpenProject& project) const {
        ProjectTransaction transaction(project);
        auto const folder = absolutePath(*removed_);
        if (!project.session().removeSyncRule(folder)) {
            throw Failure(Message("SyncRuleUnknown", ShownPaths(project.root()).ofAbsolute(folder)));
        }
        dryRun_.end(transaction, project);
    }

    void synchronise(OpenProject& project) const {
        Progress const progress(Message("ProgressSync"));
        auto const seen = project.session().planSync();
        warnOfUnreadable(seen);
        if (seen.isEmpty()) {
            warnOfAbsent(seen, project);
            report(seen, project);
            output().say(Message("SyncNothing"));
            return;
        }
        ProjectTransaction transaction(project);
        auto const plan = apply(project);
        warnOfAbsent(plan, project);
        note(plan, project);
        report(plan, project);
        if (dryRun_.isOn() && dryRun_.isJson()) {
            return; // the document contains the changes
        }
        if (dryRun_.end(transaction, project)) {
            output().say(Message("SyncDone", plan.added.size(), plan.removed.size(), plan.renamed.size()));
        }
    }

    SyncPlan apply(OpenProject& project) const {
        try {
            return project.session().sync(
                {.removesMissingFolders = isForced_, .followsRenames = settings().sourceControl});
        } catch (project::session::MoveError const& error) {
            throw failureOf(error);
        } catch (project::exception::Raised<SyncFolderMissing> const& error) {
            auto const& folder = std::get<std::u16string>(error.GetBaseMsgIDObj().getArguments().front());
            throw Failure(Message("SyncFolderMissing", ShownPaths(project.root()).ofAbsolute(Path(folder))));
        }
    }

    /// Notes what is staged at the end of the command, and how many files have changed.
    static void note(SyncPlan const& plan, OpenProject& project) {
        std::vector<Path> files;
        for (auto const& move : plan.renamed) {
            files.push_back(move.to);
        }
        for (auto const& file : plan.added) {
            files.push_back(file.path);
        }
        project.stageReturnedLater(files);
        project.changedFiles().listed += files.size() + plan.removed.size();
    }

    void report(SyncPlan const& plan, OpenProject& project) const {
        if (dryRun_.isJson()) {
            writeAsJson(plan, !dryRun_.isOn(), project);
        } else {
            Losses(project, plan).warn();
        }
    }

    static void warnOfUnreadable(SyncPlan const& plan) {
        for (auto const& folder : plan.unreadable) {
            printWarning(Message("AsReported", problemOf(folder)));
        }
    }

    /// Rules whose folder another program may have renamed.
    static void warnOfAbsent(SyncPlan const& plan, OpenProject& project) {
        auto shown = ShownPaths(project.root());
        for (auto const& folder : plan.absent) {
            printWarning(Message("FindingSyncFolderAbsent", shown.ofAbsolute(folder)));
        }
    }

    static std::set<std::u16string> patternsOf(std::vector<std::string> const& arguments) {
        std::set<std::u16string> result;
        for (auto const& argument : arguments) {
            if (argument.empty()) {
                throw WrongUse(Message("SyncPatternEmpty"));
            }
            result.insert(textOf(argument));
        }
        return result;
    }

    std::optional<std::string> folder_;
    std::optional<std::string> removed_;
    std::vector<std::string> included_;
    std::vector<std::string> excluded_;
    bool ignoresNothing_ = false;
    bool listsRules_ = false;
    bool isForced_ = false;
    DryRun dryRun_;
};

} // namespace

std::unique_ptr<Command> makeSyncCommand() {
    return std::make_unique<SyncCommand>();
}

} // namespace projectctl

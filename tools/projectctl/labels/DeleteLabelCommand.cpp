#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "labels/LabelRemoval.hpp"
#include "output/Progress.hpp"
#include "project/LabelNames.hpp"
#include "project/ProjectCommand.hpp"
#include "project/ProjectTransaction.hpp"

namespace projectctl {

namespace {

class DeleteLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("delete");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        completes(takeText(*app, "LABEL", label_), Completes::Labels)->required();
        return app;
    }

    int run(OpenProject& project) override {
        ProjectTransaction transaction(project);
        auto& labels = project.manager().getLabelManager();
        Progress const progress("Removing the label from all files");
        auto const label = LabelNames(labels).label(*category_, *label_);
        noteRemoval(project, LabelNames(labels).choice(*category_, label_));
        labels.deleteLabel(label.getCategory(), label.getLabelIdentifier());
        transaction.commit();
        return 0;
    }

private:
    std::optional<std::string> category_;
    std::optional<std::string> label_;
};

} // namespace

std::unique_ptr<Command> makeDeleteLabelCommand() {
    return std::make_unique<DeleteLabelCommand>();
}

} // namespace projectctl

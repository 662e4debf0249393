#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/CategoryCommands.hpp"
#include "labels/LabelRemoval.hpp"
#include "output/Progress.hpp"
#include "project/LabelNames.hpp"
#include "project/ProjectCommand.hpp"
#include "project/ProjectTransaction.hpp"

namespace projectctl {

namespace {

class DeleteCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("delete");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        return app;
    }

    int run(OpenProject& project) override {
        ProjectTransaction transaction(project);
        auto& labels = project.manager().getLabelManager();
        Progress const progress("Removing the labels of the category from all files");
        auto const category = LabelNames(labels).category(*category_);
        noteRemoval(project, LabelNames(labels).choice(*category_, std::nullopt));
        labels.deleteCategory(category);
        transaction.commit();
        return 0;
    }

private:
    std::optional<std::string> category_;
};

} // namespace

std::unique_ptr<Command> makeDeleteCategoryCommand() {
    return std::make_unique<DeleteCategoryCommand>();
}

} // namespace projectctl

#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/CategoryCommands.hpp"
#include "output/Progress.hpp"
#include "project/LabelNames.hpp"
#include "project/ProjectCommand.hpp"

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
        auto const guard = project.store().acquireWriteLock();
        auto& labels = project.manager().getLabelManager();
        Progress const progress("Removing the labels of the category from all files");
        labels.deleteCategory(LabelNames(labels).category(*category_));
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

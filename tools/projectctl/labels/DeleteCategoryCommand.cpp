#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/CategoryCommands.hpp"
#include "labels/LabelRemoval.hpp"
#include "output/Progress.hpp"
#include "project/LabelNames.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class DeleteCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("delete");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        layers_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        Progress const progress(Message("ProgressDeleteCategory"));
        auto const layer = layers_.forChange(project, *category_);
        changeLabels(project, layer, [&] {
            LabelNames names(layer.labels());
            noteRemoval(project, layer, names.choice(*category_, std::nullopt));
            layer.labels().deleteCategory(names.category(*category_));
        });
        return 0;
    }

private:
    std::optional<std::string> category_;
    LayerOptions layers_;
};

} // namespace

std::unique_ptr<Command> makeDeleteCategoryCommand() {
    return std::make_unique<DeleteCategoryCommand>();
}

} // namespace projectctl

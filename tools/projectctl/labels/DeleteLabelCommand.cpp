#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "labels/LabelRemoval.hpp"
#include "output/Progress.hpp"
#include "project/LabelNames.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class DeleteLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("delete");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        completes(takeText(*app, "LABEL", label_), Completes::Labels)->required();
        layers_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        Progress const progress(Message("ProgressDeleteLabel"));
        auto const layer = layers_.forChange(project, *category_);
        changeLabels(project, layer, [&] {
            LabelNames names(layer.labels());
            auto const label = names.label(*category_, *label_);
            noteRemoval(project, layer, names.choice(*category_, label_));
            layer.labels().deleteLabel(label.getCategory(), label.getLabelIdentifier());
        });
        return 0;
    }

private:
    std::optional<std::string> category_;
    std::optional<std::string> label_;
    LayerOptions layers_;
};

} // namespace

std::unique_ptr<Command> makeDeleteLabelCommand() {
    return std::make_unique<DeleteLabelCommand>();
}

} // namespace projectctl

#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "output/NameForms.hpp"
#include "project/LabelNames.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::LabelDefinition;
using project::management::LabelReadOnlyState;

class CreateLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        takeText(*app, "NAME", name_)->required();
        auto* const readOnly = app->add_flag("--read-only", isReadOnly_);
        app->add_flag("--writable", isWritable_)->excludes(readOnly);
        layers_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        auto const layer = layers_.forChange(project, *category_);
        LabelLayer::Guard const guard(layer);
        auto& labels = layer.labels();
        LabelDefinition label(textOf(*name_));
        if (isReadOnly_ || isWritable_) {
            label.setIsReadOnly(isReadOnly_ ? LabelReadOnlyState::READ_ONLY : LabelReadOnlyState::WRITABLE);
        }
        labels.createLabel(LabelNames(labels).category(*category_), label);
        return 0;
    }

private:
    std::optional<std::string> category_;
    std::optional<std::string> name_;
    LayerOptions layers_;
    bool isReadOnly_ = false;
    bool isWritable_ = false;
};

} // namespace

std::unique_ptr<Command> makeCreateLabelCommand() {
    return std::make_unique<CreateLabelCommand>();
}

} // namespace projectctl

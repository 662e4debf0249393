#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/CategoryCommands.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class CreateCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create");
        takeText(*app, "NAME", name_)->required();
        app->add_flag("--read-only", isReadOnly_);
        app->add_flag("--single-valued", isSingleValued_);
        completes(takeText(*app, "--type", type_), Completes::DataTypes);
        layers_.declarePersonal(*app);
        return app;
    }

    int run(OpenProject& project) override {
        project::management::CategoryDefinition category(textOf(*name_));
        category.setIsReadOnly(isReadOnly_).setIsSingleValued(isSingleValued_);
        if (type_) {
            category.setDataType(textOf(*type_));
        }
        auto const layer = layers_.forNew(project);
        layer.labels().createCategory(category);
        if (LabelLayer(project, !layer.isPersonal()).hasCategory(*name_)) {
            printHint(Message("CategoryNowInBothLayers", *name_));
        }
        return 0;
    }

private:
    LayerOptions layers_;
    std::optional<std::string> name_;
    std::optional<std::string> type_;
    bool isReadOnly_ = false;
    bool isSingleValued_ = false;
};

} // namespace

std::unique_ptr<Command> makeCreateCategoryCommand() {
    return std::make_unique<CreateCategoryCommand>();
}

} // namespace projectctl

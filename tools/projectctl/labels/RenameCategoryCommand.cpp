#include <algorithm>
#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/CategoryCommands.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/LabelNames.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::CategoryIdentifier;

class RenameCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("rename");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        takeText(*app, "NAME", name_)->required();
        layers_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        auto const layer = layers_.forChange(project, *category_);
        LabelLayer::Guard const guard(layer);
        auto& labels = layer.labels();
        labels.renameCategory(LabelNames(labels).category(*category_), textOf(*name_));
        warnOfSharedName(labels.getAllCategories());
        return 0;
    }

private:
    /// Several categories may have the same name, but then the name no longer identifies any of them.
    void warnOfSharedName(std::vector<CategoryIdentifier> const& categories) const {
        std::u16string const name = textOf(*name_);
        auto const count = std::ranges::count(categories, name, &CategoryIdentifier::getName);
        if (count > 1) {
            printWarning(Message("CategoriesWithOneName", count, name));
        }
    }

    std::optional<std::string> category_;
    std::optional<std::string> name_;
    LayerOptions layers_;
};

} // namespace

std::unique_ptr<Command> makeRenameCategoryCommand() {
    return std::make_unique<RenameCategoryCommand>();
}

} // namespace projectctl

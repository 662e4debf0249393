#include <string>

#include "labels/CategoryCommands.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::CategoryDefinition;
using project::management::CategoryIdentifier;

class ListCategoriesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list");
        layers_.declare(*app);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto const guards = layers_.readGuards(project);
        auto const categories = layers_.categories(project);
        isJson_ ? writeJson(categories) : writeLines(categories);
        return 0;
    }

    bool isListing() const override { return true; }

private:
    static void writeLines(std::vector<LayerCategory> const& categories) {
        for (auto const& [layer, category] : categories) {
            output().name(category.getName());
            output().text() += attributesOf(layer, category);
            output().text() += '\n';
        }
    }

    static void writeJson(std::vector<LayerCategory> const& categories) {
        JsonRows rows(json::categoryList, "categories");
        for (auto const& [layer, category] : categories) {
            rows.begin();
            rows.addText("name", category.getName());
            rows.addText("uuid", category.getUUID());
            rows.addFlag("readOnly", category.isReadOnly());
            rows.addFlag("singleValued", category.isSingleValued());
            rows.addText("type", category.getDataType());
            rows.addFlag("personal", layer.isPersonal());
        }
        rows.finish();
    }

    /// The differences from a category of the project that was created without options: " (read-only, type
    /// Number)".
    static std::string attributesOf(LabelLayer const& layer, CategoryIdentifier const& category) {
        std::string result;
        auto const append = [&result](std::string const& attribute) {
            result += (result.empty() ? " (" : ", ") + attribute;
        };
        if (layer.isPersonal()) {
            append("personal");
        }
        if (category.isReadOnly()) {
            append("read-only");
        }
        if (category.isSingleValued()) {
            append("single-valued");
        }
        if (std::u16string const type = category.getDataType();
            type != CategoryDefinition({}, {}).getDataType()) {
            std::string bytes;
            appendBytes(bytes, type);
            append("type " + withoutControls(bytes, false));
        }
        return result + (result.empty() ? "" : ")");
    }

    LayerOptions layers_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeListCategoriesCommand() {
    return std::make_unique<ListCategoriesCommand>();
}

} // namespace projectctl

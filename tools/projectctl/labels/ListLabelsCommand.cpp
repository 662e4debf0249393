#include <algorithm>
#include <optional>
#include <string>
#include <vector>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "output/JsonRows.hpp"
#include "output/Output.hpp"
#include "project/LabelNames.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::CategoryIdentifier;
using project::management::LabelIdentifier;
using project::management::LabelReadOnlyState;

class ListLabelsCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories);
        layers_.declare(*app);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto const guards = layers_.readGuards(project);
        JsonRows rows(json::labelList, "labels");
        for (auto const& [layer, category] : categories(project)) {
            auto ofCategory = layer.labels().getLabels(category);
            std::ranges::stable_sort(ofCategory, {}, &LabelIdentifier::getName);
            for (auto const& label : ofCategory) {
                isJson_ ? writeJson(rows, layer, category, label) : writeLine(layer, category, label);
            }
        }
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

    bool isListing() const override { return true; }

private:
    std::vector<LayerCategory> categories(OpenProject& project) const {
        if (!category_) {
            return layers_.categories(project);
        }
        auto const layer = layers_.ofCategory(project, *category_);
        return {{layer, LabelNames(layer.labels()).category(*category_)}};
    }

    static void writeJson(JsonRows& rows, LabelLayer const& layer, CategoryIdentifier const& category,
                          LabelIdentifier const& label) {
        rows.begin();
        bool const inherits = label.isReadOnly() == LabelReadOnlyState::INHERITED;
        rows.addNamed("category", category.getName(), category.getUUID());
        rows.addNamed("label", label.getName(), label.getUUID());
        rows.addFlag("readOnly",
                     inherits ? category.isReadOnly() : label.isReadOnly() == LabelReadOnlyState::READ_ONLY);
        rows.addFlag("inheritsReadOnly", inherits);
        rows.addFlag("personal", layer.isPersonal());
    }

    void writeLine(LabelLayer const& layer, CategoryIdentifier const& category,
                   LabelIdentifier const& label) const {
        if (!category_) {
            output().name(category.getName());
            output().text() += ": ";
        }
        output().name(label.getName());
        if (label.isReadOnly() != LabelReadOnlyState::INHERITED) {
            bool const isReadOnly = label.isReadOnly() == LabelReadOnlyState::READ_ONLY;
            output().text() += isReadOnly ? " (read-only)" : " (writable)";
        }
        if (layer.isPersonal()) {
            output().text() += " (personal)";
        }
        output().text() += '\n';
    }

    std::optional<std::string> category_;
    LayerOptions layers_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeListLabelsCommand() {
    return std::make_unique<ListLabelsCommand>();
}

} // namespace projectctl

#include <algorithm>
#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "output/JsonRows.hpp"
#include "output/Output.hpp"
#include "project/LabelNames.hpp"
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
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto const guard = project.store().acquireReadLock();
        auto& labels = project.manager().getLabelManager();
        auto categories =
            category_ ? std::vector{LabelNames(labels).category(*category_)} : labels.getAllCategories();
        std::ranges::stable_sort(categories, {}, &CategoryIdentifier::getName);
        JsonRows rows(json::labelList, "labels");
        for (auto const& category : categories) {
            auto ofCategory = labels.getLabels(category);
            std::ranges::stable_sort(ofCategory, {}, &LabelIdentifier::getName);
            for (auto const& label : ofCategory) {
                isJson_ ? writeJson(rows, category, label) : writeLine(category, label);
            }
        }
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

    bool isListing() const override { return true; }

private:
    static void writeJson(JsonRows& rows, CategoryIdentifier const& category, LabelIdentifier const& label) {
        rows.begin();
        bool const inherits = label.isReadOnly() == LabelReadOnlyState::INHERITED;
        rows.addNamed("category", category.getName(), category.getUUID());
        rows.addNamed("label", label.getName(), label.getUUID());
        rows.addFlag("readOnly",
                     inherits ? category.isReadOnly() : label.isReadOnly() == LabelReadOnlyState::READ_ONLY);
        rows.addFlag("inheritsReadOnly", inherits);
    }

    void writeLine(CategoryIdentifier const& category, LabelIdentifier const& label) const {
        if (!category_) {
            output().name(category.getName());
            output().text() += ": ";
        }
        output().name(label.getName());
        if (label.isReadOnly() != LabelReadOnlyState::INHERITED) {
            bool const isReadOnly = label.isReadOnly() == LabelReadOnlyState::READ_ONLY;
            output().text() += isReadOnly ? " (read-only)" : " (writable)";
        }
        output().text() += '\n';
    }

    std::optional<std::string> category_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeListLabelsCommand() {
    return std::make_unique<ListLabelsCommand>();
}

} // namespace projectctl

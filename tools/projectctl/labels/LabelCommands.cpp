#include "labels/LabelCommands.hpp"

#include <algorithm>
#include <optional>
#include <string>

#include "cli/CommandGroup.hpp"
#include "cli/TextArguments.hpp"
#include "labels/Commands.hpp"
#include "labels/LabelNames.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::CategoryIdentifier;
using project::management::LabelDefinition;
using project::management::LabelIdentifier;
using project::management::LabelReadOnlyState;

class CreateLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create", "Make a label in a category");
        takeText(*app, "CATEGORY", category_, "The category's name or UUID")->required();
        takeText(*app, "NAME", name_, "The name of the label")->required();
        auto* const readOnly = app->add_flag("--read-only", readOnly_, "It cannot be deleted");
        app->add_flag("--writable", writable_, "It can be deleted, even if its category is read-only")
            ->excludes(readOnly);
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& labels = project.manager().getLabelManager();
        LabelDefinition label(textOf(*name_));
        if (readOnly_ || writable_) {
            label.setIsReadOnly(readOnly_ ? LabelReadOnlyState::READ_ONLY : LabelReadOnlyState::WRITABLE);
        }
        labels.createLabel(LabelNames(labels).category(*category_), label);
        return 0;
    }

private:
    std::optional<std::string> category_;
    std::optional<std::string> name_;
    bool readOnly_ = false;
    bool writable_ = false;
};

class ListLabelsCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list", "List the labels of all categories, or of one");
        takeText(*app, "CATEGORY", category_, "The category's name or UUID");
        app->add_flag("--json", json_, "As a JSON array of objects, with the UUIDs");
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto const guard = project.store().acquireReadLock();
        auto& labels = project.manager().getLabelManager();
        auto categories =
            category_ ? std::vector{LabelNames(labels).category(*category_)} : labels.getAllCategories();
        std::ranges::stable_sort(categories, {}, &CategoryIdentifier::getName);
        JsonRows rows;
        for (auto const& category : categories) {
            auto ofCategory = labels.getLabels(category);
            std::ranges::stable_sort(ofCategory, {}, &LabelIdentifier::getName);
            for (auto const& label : ofCategory) {
                json_ ? writeJson(rows, category, label) : writeLine(category, label);
            }
        }
        if (json_) {
            rows.finishOutput();
        }
        return 0;
    }

private:
    static void writeJson(JsonRows& rows, CategoryIdentifier const& category, LabelIdentifier const& label) {
        rows.begin();
        rows.addText("category", category.getName());
        rows.addText("categoryUuid", category.getUUID());
        rows.addText("label", label.getName());
        rows.addText("labelUuid", label.getUUID());
        rows.addText("readOnly", labelTypeToString(label.isReadOnly()));
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
    bool json_ = false;
};

class DeleteLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("delete", "Delete a label, also from all files");
        takeText(*app, "CATEGORY", category_, "The category's name or UUID")->required();
        takeText(*app, "LABEL", label_, "The label's name or UUID")->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& labels = project.manager().getLabelManager();
        Progress const progress("Taking the label off all files");
        auto const label = LabelNames(labels).label(*category_, *label_);
        labels.deleteLabel(label.getCategory(), label.getLabelIdentifier());
        return 0;
    }

private:
    std::optional<std::string> category_;
    std::optional<std::string> label_;
};

} // namespace

std::unique_ptr<Command> makeCreateLabelCommand() {
    return std::make_unique<CreateLabelCommand>();
}

std::unique_ptr<Command> makeListLabelsCommand() {
    return std::make_unique<ListLabelsCommand>();
}

std::unique_ptr<Command> makeDeleteLabelCommand() {
    return std::make_unique<DeleteLabelCommand>();
}

std::unique_ptr<Command> makeLabelCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeCreateLabelCommand());
    members.push_back(makeListLabelsCommand());
    members.push_back(makeDeleteLabelCommand());
    members.push_back(makePutLabelCommand());
    members.push_back(makeTakeLabelCommand());
    members.push_back(makeShowLabelsCommand());
    members.push_back(makeFindLabelCommand());
    return std::make_unique<CommandGroup>(
        "label", "Make, list and delete labels, put them on files, take them off and find them",
        std::move(members));
}

} // namespace projectctl

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

using project::management::CategoryDefinition;
using project::management::CategoryIdentifier;

class CreateCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create", "Make a category of labels");
        takeText(*app, "NAME", name_, "The name of the category")->required();
        app->add_flag("--read-only", readOnly_, "It cannot be renamed or deleted");
        app->add_flag("--single-valued", singleValued_, "A file bears at most one label of it");
        takeText(*app, "--type", type_, "What data its labels carry on a file; None by default");
        return app;
    }

    int run(OpenProject& project) override {
        CategoryDefinition category(textOf(*name_));
        category.setIsReadOnly(readOnly_).setIsSingleValued(singleValued_);
        if (type_) {
            category.setDataType(textOf(*type_));
        }
        project.manager().getLabelManager().createCategory(category);
        return 0;
    }

private:
    std::optional<std::string> name_;
    std::optional<std::string> type_;
    bool readOnly_ = false;
    bool singleValued_ = false;
};

class ListCategoriesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list", "List the project's categories");
        app->add_flag("--json", json_, "As a JSON array of objects, with the UUIDs");
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto categories = project.manager().getLabelManager().getAllCategories();
        std::ranges::stable_sort(categories, {}, &CategoryIdentifier::getName);
        if (json_) {
            writeJson(categories);
            return 0;
        }
        for (auto const& category : categories) {
            output().name(category.getName());
            output().text() += attributesOf(category);
            output().text() += '\n';
        }
        return 0;
    }

private:
    static void writeJson(std::vector<CategoryIdentifier> const& categories) {
        JsonRows rows;
        for (auto const& category : categories) {
            rows.begin();
            rows.addText("name", category.getName());
            rows.addText("uuid", category.getUUID());
            rows.addFlag("readOnly", category.isReadOnly());
            rows.addFlag("singleValued", category.isSingleValued());
            rows.addText("type", category.getDataType());
        }
        rows.finishOutput();
    }

    /// What sets it apart from a category made without options: " (read-only, type Number)".
    static std::string attributesOf(CategoryIdentifier const& category) {
        std::string result;
        auto const append = [&result](std::string const& attribute) {
            result += (result.empty() ? " (" : ", ") + attribute;
        };
        if (category.isReadOnly()) {
            append("read-only");
        }
        if (category.isSingleValued()) {
            append("single-valued");
        }
        if (auto const type = category.getDataType(); type != CategoryDefinition({}, {}).getDataType()) {
            std::string bytes;
            appendBytes(bytes, type);
            append("type " + withoutControls(bytes, false));
        }
        return result + (result.empty() ? "" : ")");
    }

    bool json_ = false;
};

class RenameCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("rename", "Give a category another name");
        takeText(*app, "CATEGORY", category_, "Its name or UUID")->required();
        takeText(*app, "NAME", name_, "The new name")->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& labels = project.manager().getLabelManager();
        labels.renameCategory(LabelNames(labels).category(*category_), textOf(*name_));
        warnOfNamesakes(labels.getAllCategories());
        return 0;
    }

private:
    /// Two may bear one name, but the name is no use then.
    void warnOfNamesakes(std::vector<CategoryIdentifier> const& categories) const {
        auto const name = textOf(*name_);
        auto const count = std::ranges::count(categories, name, &CategoryIdentifier::getName);
        if (count > 1) {
            printError("warning: " + std::to_string(count) + " categories are called " + inQuotes(name) +
                       " now; they can be told apart by their UUIDs alone");
        }
    }

    std::optional<std::string> category_;
    std::optional<std::string> name_;
};

class DeleteCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app =
            group.add_subcommand("delete", "Delete a category with its labels, also from all files");
        takeText(*app, "CATEGORY", category_, "Its name or UUID")->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& labels = project.manager().getLabelManager();
        Progress const progress("Taking its labels off all files");
        labels.deleteCategory(LabelNames(labels).category(*category_));
        return 0;
    }

private:
    std::optional<std::string> category_;
};

} // namespace

std::unique_ptr<Command> makeCategoryCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(std::make_unique<CreateCategoryCommand>());
    members.push_back(std::make_unique<ListCategoriesCommand>());
    members.push_back(std::make_unique<RenameCategoryCommand>());
    members.push_back(std::make_unique<DeleteCategoryCommand>());
    return std::make_unique<CommandGroup>("category", "Make, list, rename and delete categories of labels",
                                          std::move(members));
}

} // namespace projectctl

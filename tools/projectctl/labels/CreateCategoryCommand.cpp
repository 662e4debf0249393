#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/CategoryCommands.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class CreateCategoryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create", "Create a category of labels");
        takeText(*app, "NAME", name_, "The name of the category")->required();
        app->add_flag("--read-only", isReadOnly_, "Do not allow it to be renamed or deleted");
        app->add_flag("--single-valued", isSingleValued_, "Allow at most one label of it per file");
        completes(takeText(*app, "--type", type_,
                           "The type of the data that its labels have on a file (default: None)"),
                  Completes::DataTypes);
        return app;
    }

    int run(OpenProject& project) override {
        project::management::CategoryDefinition category(textOf(*name_));
        category.setIsReadOnly(isReadOnly_).setIsSingleValued(isSingleValued_);
        if (type_) {
            category.setDataType(textOf(*type_));
        }
        project.manager().getLabelManager().createCategory(category);
        return 0;
    }

private:
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

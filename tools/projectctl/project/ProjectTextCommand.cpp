#include <optional>
#include <string>

#include "cli/TextArguments.hpp"
#include "output/JsonDocument.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::ProjectManager;

/// Shows or sets the name or the description of the project. The tool preserves any bytes in them, as in file
/// names.
class ProjectTextCommand : public ProjectCommand {
public:
    using Getter = std::u16string (ProjectManager::*)() const;
    using Setter = void (ProjectManager::*)(std::u16string const&);

    ProjectTextCommand(std::string name, Getter get, Setter set)
        : name_(std::move(name)), get_(get), set_(set) {}

    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(name_);
        takeText(*app, "TEXT", text_);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        if (text_) {
            (project.manager().*set_)(textOf(*text_));
        } else {
            show((project.manager().*get_)());
        }
        return 0;
    }

private:
    void show(std::u16string const& text) const {
        if (isJson_) {
            JsonDocument document(name_ == "name" ? json::name : json::description);
            document.addText(name_, text);
            document.finish();
            return;
        }
        std::string bytes;
        appendBytes(bytes, text);
        output().text() += output().isTerminal() ? withoutControls(bytes, true) : bytes;
        output().text() += '\n';
    }

    std::string name_;
    Getter get_;
    Setter set_;
    std::optional<std::string> text_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeNameCommand() {
    return std::make_unique<ProjectTextCommand>("name", &ProjectManager::getName, &ProjectManager::setName);
}

std::unique_ptr<Command> makeDescriptionCommand() {
    return std::make_unique<ProjectTextCommand>("description", &ProjectManager::getDescription,
                                                &ProjectManager::setDescription);
}

} // namespace projectctl

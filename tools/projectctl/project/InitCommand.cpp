#include <optional>
#include <string>

#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "git/MergeSetup.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "project/OpenProject.hpp"
#include "project/ProjectFolder.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Makes a project in a folder.
class InitCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("init", "Make a project in a folder");
        takeText(*app, "FOLDER", folder_, "The project's root folder; the current one by default");
        takeText(*app, "--name", name_, "The project's name; the folder's by default");
        return app;
    }

    int run() override {
        auto const root = folder_ ? chosenFolder(*folder_) : workingFolder();
        requireNoProject(root);
        auto const name = name_ ? textOf(*name_) : nameOf(root);
        OpenProject::make(root, name).stage();
        if (settings().sourceControl && lookForMergeSetup(root) == MergeSetup::Missing) {
            setUpMerge(root);
        }
        output().say("There is a project in \"" + shown(root) +
                     "\" now. 'projectctl add' puts files into it.");
        return 0;
    }

private:
    static Path chosenFolder(std::string const& argument) {
        auto folder = fl::filesystem::canonical(fl::filesystem::fromSystem(argument), workingFolder());
        if (argument.empty() || !project::metadata::is_directory(folder)) {
            throw Failure("there is no folder \"" + shown(fl::filesystem::fromSystem(argument)) +
                          "\". Make it first.");
        }
        return folder;
    }

    static void requireNoProject(Path const& root) {
        if (lookForProject(root) != ProjectTrace::None) {
            findProjectRoot(root); // tells of a text that is missing
            throw Failure("there is a project in \"" + shown(root) + "\" already");
        }
    }

    static std::u16string nameOf(Path const& root) {
        auto const above = project::metadata::getParentFolder(root);
        return above == root ? root.native() : project::metadata::getRelativePath(above, root);
    }

    std::optional<std::string> folder_;
    std::optional<std::string> name_;
};

} // namespace

std::unique_ptr<Command> makeInitCommand() {
    return std::make_unique<InitCommand>();
}

} // namespace projectctl

#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "git/MergeSetup.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/Commands.hpp"
#include "project/OpenProject.hpp"
#include "project/ProjectFolder.hpp"
#include "project/SharedRoles.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Creates a project in a folder.
class InitCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("init");
        completes(takeText(*app, "FOLDER", folder_), Completes::Folders);
        takeText(*app, "--name", name_);
        auto* const store = takeText(*app, "--store", store_);
        takeRoles(*app, *store, reader_, writer_);
        return app;
    }

    int run() override {
        auto const root = folder_ ? chosenFolder(*folder_) : workingFolder();
        requireNoProject(root);
        Progress const progress(Message("ProgressInit"));
        std::u16string const name = name_ ? textOf(*name_) : nameOf(root);
        if (store_) {
            OpenProject::createShared(root, name, sharedStore(*store_, name, reader_, writer_)).stage();
        } else {
            OpenProject::create(root, name).stage();
        }
        if (!store_ && settings().sourceControl) {
            auto const setup = mergeSetupOf(root);
            if (setup == MergeSetup::Missing || setup == MergeSetup::ProgramMissing) {
                setUpMerge(root);
            }
        }
        output().say("Created a project in \"" + shown(root) + "\". 'projectctl add' adds files to it.");
        return 0;
    }

private:
    static Path chosenFolder(std::string const& argument) {
        auto folder = fl::filesystem::canonical(fl::filesystem::fromSystem(argument), workingFolder());
        if (argument.empty() || !project::metadata::is_directory(folder)) {
            throw Failure("there is no folder \"" + shown(fl::filesystem::fromSystem(argument)) +
                          "\". Create it first.");
        }
        return folder;
    }

    static void requireNoProject(Path const& root) {
        auto trace = findProjectIn(root);
        if (trace == ProjectTrace::TextMissing) {
            trace = findFinishedProjectIn(root);
        }
        if (trace != ProjectTrace::None) {
            findProjectRoot(root); // throws if the text is missing
            throw Failure("there is already a project in \"" + shown(root) + '"');
        }
    }

    static std::u16string nameOf(Path const& root) {
        auto const above = project::metadata::getParentFolder(root);
        return above == root ? root.native() : project::metadata::getRelativePath(above, root);
    }

    std::optional<std::string> folder_;
    std::optional<std::string> name_;
    std::optional<std::string> store_;
    std::optional<std::string> reader_;
    std::optional<std::string> writer_;
};

} // namespace

std::unique_ptr<Command> makeInitCommand() {
    return std::make_unique<InitCommand>();
}

} // namespace projectctl

#include <cstddef>
#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "git/MergeSetup.hpp"
#include "output/Failure.hpp"
#include "output/JsonDocument.hpp"
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
    using AddTree = std::size_t (*)(OpenProject& project);

    explicit InitCommand(AddTree addTree) : addTree_(addTree) {}

    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("init");
        completes(takeText(*app, "FOLDER", folder_), Completes::Folders);
        takeText(*app, "--name", name_);
        app->add_flag("--add", addsTree_);
        auto* const store = takeText(*app, "--store", store_);
        takeRoles(*app, *store, reader_, writer_);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run() override {
        auto const root = folder_ ? chosenFolder(*folder_) : workingFolder();
        requireNoProject(root);
        Progress const progress(Message("ProgressInit"));
        std::u16string const name = name_ ? textOf(*name_) : nameOf(root);
        std::size_t const added = create(root, name);
        if (!store_ && settings().sourceControl) {
            auto const setup = mergeSetupOf(root);
            if (setup == MergeSetup::Missing || setup == MergeSetup::ProgramMissing) {
                setUpMerge(root);
            }
        }
        if (isJson_) {
            JsonDocument document(json::init);
            document.addText("root", root.native());
            document.addText("name", name);
            document.finish();
        }
        output().say(addsTree_ ? Message("CreatedWithFiles", shown(root), added)
                               : Message("Created", shown(root)));
        return 0;
    }

private:
    /// @return the number of files and folders that were added.
    std::size_t create(Path const& root, std::u16string const& name) const {
        auto project =
            store_ ? OpenProject::createShared(root, name, sharedStore(*store_, name, reader_, writer_))
                   : OpenProject::create(root, name);
        std::size_t const added = addsTree_ ? addTree_(project) : 0;
        project.stage();
        return added;
    }

    static Path chosenFolder(std::string const& argument) {
        auto folder = fl::filesystem::canonical(fl::filesystem::fromSystem(argument), workingFolder());
        if (argument.empty() || !project::metadata::is_directory(folder)) {
            throw Failure(Message("NoSuchFolder", shown(fl::filesystem::fromSystem(argument))));
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
            throw Failure(Message("ProjectExists", shown(root)));
        }
    }

    static std::u16string nameOf(Path const& root) {
        auto const above = project::metadata::getParentFolder(root);
        return above == root ? root.native() : project::metadata::getRelativePath(above, root);
    }

    AddTree addTree_;
    bool addsTree_ = false;
    std::optional<std::string> folder_;
    std::optional<std::string> name_;
    std::optional<std::string> store_;
    std::optional<std::string> reader_;
    std::optional<std::string> writer_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeInitCommand(std::size_t (*addTree)(OpenProject& project)) {
    return std::make_unique<InitCommand>(addTree);
}

} // namespace projectctl

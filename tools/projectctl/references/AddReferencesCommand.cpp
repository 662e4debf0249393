#include <string>
#include <vector>

#include "cli/Completes.hpp"
#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/references/FolderReference.hpp"
#include "references/ReferenceCommands.hpp"

namespace projectctl {

namespace {

using project::management::FolderReference;

class AddReferencesCommand : public ProjectCommand {
public:
    explicit AddReferencesCommand(ReferenceList const& list) : list_(list) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("add");
        completes(takeTexts(*app, "FOLDER", arguments_), Completes::Folders)->required();
        if (list_.isOfProjects) {
            app->add_flag("--absolute", isAbsolute_);
        }
        return app;
    }

    int run(OpenProject& project) override {
        std::vector<FolderReference> references;
        for (auto const& folder : absolutePaths(arguments_)) {
            if (!project::metadata::is_directory(folder)) {
                throw Failure(Message("NotAFolder", shown(folder)));
            }
            references.push_back(isAbsolute_ ? project::management::absoluteFolderReference(folder)
                                             : relativeReference(folder, project.root()));
        }
        list_.manager(project).addReferences(references);
        return 0;
    }

private:
    /// The stored path has "/" in place of every backslash, and may lead elsewhere.
    FolderReference relativeReference(Path const& folder, Path const& root) const {
        auto result = project::management::relativeFolderReference(folder, root);
        if (project::metadata::getRelativePath(root, result.getLocation()) != result.getStoredPath()) {
            throw Failure(
                Message(list_.isOfProjects ? "ProjectWithBackslash" : "FolderWithBackslash", shown(folder)));
        }
        return result;
    }

    ReferenceList const& list_;
    std::vector<std::string> arguments_;
    bool isAbsolute_ = false;
};

} // namespace

std::unique_ptr<Command> makeAddReferencesCommand(ReferenceList const& list) {
    return std::make_unique<AddReferencesCommand>(list);
}

} // namespace projectctl

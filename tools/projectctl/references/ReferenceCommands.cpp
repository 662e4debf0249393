#include <algorithm>
#include <functional>
#include <optional>
#include <vector>

#include "cli/ArgumentPaths.hpp"
#include "cli/Choice.hpp"
#include "cli/CommandGroup.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "output/Failure.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/Schema.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/references/FolderReference.hpp"
#include "references/Commands.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

namespace {

using project::management::FolderReference;

std::vector<Path> absolutePaths(std::vector<std::string> const& arguments) {
    ArgumentPaths absolute(workingFolder());
    std::vector<Path> result;
    result.reserve(arguments.size());
    for (auto const& argument : arguments) {
        result.push_back(absolute.absolute(argument));
    }
    return result;
}

class AddReferencesCommand : public ProjectCommand {
public:
    explicit AddReferencesCommand(ReferenceList const& list) : list_(list) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("add", "Add folders to " + list_.name);
        takeTexts(*app, "FOLDER", arguments_, "A folder, in or outside of the project")->required();
        if (list_.isOfProjects) {
            app->add_flag("--absolute", absolute_,
                          "Keep the path from the disk's root, instead of the one from the project's");
        }
        return app;
    }

    int run(OpenProject& project) override {
        std::vector<FolderReference> references;
        for (auto const& folder : absolutePaths(arguments_)) {
            if (!project::metadata::is_directory(folder)) {
                throw Failure('"' + shown(folder) + "\" is no folder");
            }
            references.push_back(absolute_ ? project::management::absoluteFolderReference(folder)
                                           : relativeReference(folder, project.root()));
        }
        list_.manager(project).addReferences(references);
        return 0;
    }

private:
    /// What is stored has "/" for every backslash, and so would lead elsewhere.
    FolderReference relativeReference(Path const& folder, Path const& root) const {
        auto result = project::management::relativeFolderReference(folder, root);
        if (project::metadata::getRelativePath(root, result.getLocation()) != result.getStoredPath()) {
            throw Failure('"' + shown(folder) +
                          "\" could not be found again, because of the backslash in its path. " +
                          (list_.isOfProjects ? "Rename the folder, or add it with --absolute"
                                              : "Rename the folder first"));
        }
        return result;
    }

    ReferenceList const& list_;
    std::vector<std::string> arguments_;
    bool absolute_ = false;
};

class ListReferencesCommand : public ProjectCommand {
public:
    explicit ListReferencesCommand(ReferenceList const& list) : list_(list) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app =
            group.add_subcommand("list", "List the folders of " + list_.name +
                                             ", as they are kept: from the project's root, or from "
                                             "the disk's");
        app->add_flag("--json", json_, "As a JSON array of objects, with where each leads on this machine");
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto references = list_.manager(project).getReferences();
        std::ranges::stable_sort(references, std::less<>(), &FolderReference::getLocation);
        JsonRows rows;
        for (auto const& reference : references) {
            if (json_) {
                rows.begin();
                rows.addText("path", reference.getStoredPath());
                rows.addText("type", reference.getType());
                rows.addText("location", reference.getLocation().native());
                rows.addText("uuid", reference.getUUID());
            } else {
                output().name(reference.getStoredPath().empty() ? u"." : reference.getStoredPath());
                output().text() += '\n';
            }
        }
        if (json_) {
            rows.finishOutput();
        }
        return 0;
    }

private:
    ReferenceList const& list_;
    bool json_ = false;
};

class RemoveReferencesCommand : public ProjectCommand {
public:
    explicit RemoveReferencesCommand(ReferenceList const& list) : list_(list) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("remove", "Remove folders from " + list_.name);
        takeTexts(*app, "FOLDER", arguments_, "A folder, the path that list shows, or the UUID of one entry")
            ->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto const present = list_.manager(project).getReferences();
        std::vector<FolderReference> removed;
        for (auto const& argument : arguments_) {
            auto const meant = meantBy(argument, project, present);
            removed.insert(removed.end(), meant.begin(), meant.end());
        }
        list_.manager(project).removeReferences(removed);
        return 0;
    }

private:
    /// @throws Failure when it is none.
    std::vector<FolderReference> meantBy(std::string const& argument, OpenProject& project,
                                         std::vector<FolderReference> const& present) const {
        auto const text = textOf(argument);
        if (isUUID(text) && isStored(project, text)) {
            return {FolderReference(Path(), {}, {}, text)}; // also one that nothing can read
        }
        auto const folder = followed(absolutePaths({argument}).front());
        std::vector<FolderReference> result;
        std::ranges::copy_if(present, std::back_inserter(result), [&](FolderReference const& reference) {
            return followed(reference.getLocation()) == folder;
        });
        if (result.empty()) { // as the folder that list shows, and perhaps cannot be found
            std::ranges::copy_if(present, std::back_inserter(result), [&](FolderReference const& reference) {
                return reference.getStoredPath() == text;
            });
        }
        if (result.empty()) {
            throw Failure(inQuotes(text) + " is not among the folders of " + list_.name);
        }
        return result;
    }

    bool isStored(OpenProject& project, std::u16string const& uuid) const {
        using project::metadata::PathElement;
        return project.store().pathExists(
            project::metadata::MetadataPath::root()
                .child(PathElement(std::u16string(list_.head), std::u16string(schema::root)))
                .child(PathElement(std::u16string(schema::reference), uuid)));
    }

    ReferenceList const& list_;
    std::vector<std::string> arguments_;
};

std::unique_ptr<Command> makeListCommands(std::string const& name, std::string const& description,
                                          ReferenceList const& list) {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(std::make_unique<AddReferencesCommand>(list));
    members.push_back(std::make_unique<ListReferencesCommand>(list));
    members.push_back(std::make_unique<RemoveReferencesCommand>(list));
    return std::make_unique<CommandGroup>(name, description, std::move(members));
}

} // namespace

std::unique_ptr<Command> makePathCommand() {
    return makeListCommands("path", "Add, list and remove the folders of the project path", projectPath());
}

std::unique_ptr<Command> makeReferenceCommand() {
    return makeListCommands("reference", "Add, list and remove references to other projects' folders",
                            projectReferences());
}

} // namespace projectctl

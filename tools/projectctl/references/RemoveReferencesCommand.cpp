#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

#include "cli/Choice.hpp"
#include "cli/Completes.hpp"
#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/references/FolderReference.hpp"
#include "references/ReferenceCommands.hpp"

namespace projectctl {

namespace {

using project::management::FolderReference;
using project::metadata::PathElement;

class RemoveReferencesCommand : public ProjectCommand {
public:
    explicit RemoveReferencesCommand(ReferenceList const& list) : list_(list) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("remove");
        completes(takeTexts(*app, "FOLDER", arguments_),
                  list_.isOfProjects ? Completes::References : Completes::PathFolders)
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
    /// The references that an argument names. A UUID also names a reference that no reader understands.
    /// @throws Failure if there are none.
    std::vector<FolderReference> meantBy(std::string const& argument, OpenProject& project,
                                         std::vector<FolderReference> const& present) const {
        std::u16string const text = textOf(argument);
        if (isUUID(text) && isStored(project, text)) {
            return {FolderReference(Path(), {}, {}, text)};
        }
        auto const folder = followed(absolutePath(argument));
        auto result = thoseOf(present, [&folder](FolderReference const& reference) {
            return followed(reference.getLocation()) == folder;
        });
        if (result.empty()) { // the text that `list` shows may lead to a place that cannot be followed
            ShownPaths shown(project.root());
            result = thoseOf(present, [&shown, &text](FolderReference const& reference) {
                return shown.of(reference.getStoredPath()) == text;
            });
        }
        if (result.empty()) {
            throw Failure(Message(list_.isOfProjects ? "NotReferenced" : "NotInProjectPath", text));
        }
        return result;
    }

    template <typename Predicate>
    static std::vector<FolderReference> thoseOf(std::vector<FolderReference> const& references,
                                                Predicate const& isWanted) {
        std::vector<FolderReference> result;
        std::ranges::copy_if(references, std::back_inserter(result), isWanted);
        return result;
    }

    bool isStored(OpenProject& project, std::u16string const& uuid) const {
        namespace schema = project::metadata::schema;
        return project.store().pathExists(
            project::metadata::MetadataPath::root()
                .child(PathElement(std::u16string(list_.head), schema::rootLocation))
                .child(PathElement(schema::references::referenceType, uuid)));
    }

    ReferenceList const& list_;
    std::vector<std::string> arguments_;
};

} // namespace

std::unique_ptr<Command> makeRemoveReferencesCommand(ReferenceList const& list) {
    return std::make_unique<RemoveReferencesCommand>(list);
}

} // namespace projectctl

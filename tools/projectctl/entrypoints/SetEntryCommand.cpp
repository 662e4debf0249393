#include <algorithm>
#include <optional>
#include <string>
#include <vector>

#include "cli/Completes.hpp"
#include "cli/Nearest.hpp"
#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "entrypoints/EntryCommands.hpp"
#include "entrypoints/EntryTypes.hpp"
#include "entrypoints/Groups.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/ProjectException.hpp"

namespace projectctl {

namespace {

using project::management::EntryPointDefinition;
using project::management::EntryPointManager;
using project::management::EntryPointType;
using ZEPHRA::project::management::FileNotInProject;

/// The stored path has "/" in place of every backslash. An entry point of such a file could not be found
/// again.
void requireNoBackslash(Path const& root, Path const& file) {
    std::u16string const fromRoot = project::metadata::getRelativePath(root, file);
    if (fromRoot.find(u'\\') != std::u16string::npos) {
        throw Failure(Message("EntryWithBackslash", fromRoot));
    }
}

EntryPointType typeNamed(std::u16string const& name) {
    auto const known = entryTypeNames();
    bool const isOtherName = name == u"StartUp" || name == u"Batch Job";
    if (std::ranges::find(known, name) == known.end() && !isOtherName) {
        auto const meant = nearest(name, known);
        throw Failure(meant ? Message("EntryTypeMeant", name, *meant) : Message("EntryTypeUnknown", name));
    }
    return project::management::getFromName(name);
}

class SetEntryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("set");
        completes(takeText(*app, "FILE", file_), Completes::ProjectPaths)->required();
        completes(takeText(*app, "--type", type_), Completes::EntryPointTypes);
        takeText(*app, "--name", name_);
        auto* const hidden = app->add_flag("--hidden", isHidden_);
        app->add_flag("--visible", isVisible_)->excludes(hidden);
        completes(takeText(*app, "--group", group_), Completes::EntryPointGroups);
        takeTexts(*app, "--extension", extensions_)->allow_extra_args(false);
        takeTexts(*app, "--no-extension", removed_)->allow_extra_args(false);
        return app;
    }

    int run(OpenProject& project) override {
        auto const file = absolutePath(*file_);
        requireNoBackslash(project.root(), file);
        auto const guard = project.store().acquireWriteLock();
        auto& entryPoints = project.manager().getEntryPointManager();
        auto const present = entryPoints.getEntryPoint(file);
        if (!present) {
            project::exception::raise(FileNotInProject(file.native()));
        }
        EntryPointDefinition entry(*present);
        change(entry, entryPoints);
        entryPoints.setEntryPoint(entry);
        return 0;
    }

private:
    void change(EntryPointDefinition& entry, EntryPointManager& entryPoints) const {
        if (type_) {
            entry.setType(typeNamed(textOf(*type_)));
        }
        if (name_) {
            entry.setName(textOf(*name_));
        }
        if (isHidden_ || isVisible_) {
            entry.setVisible(isVisible_);
        }
        if (group_) {
            entry.setGroup(Groups(entryPoints).named(*group_));
        }
        changeExtensions(entry);
    }

    void changeExtensions(EntryPointDefinition& entry) const {
        for (auto const& key : removed_) {
            entry.removeExtensionData(textOf(key));
        }
        for (auto const& pair : extensions_) {
            std::size_t const equals = pair.find('=');
            if (equals == std::string::npos) {
                throw Failure(Message("NotAnExtension", pair));
            }
            entry.setExtensionData(textOf(pair.substr(0, equals)), textOf(pair.substr(equals + 1)));
        }
    }

    std::optional<std::string> file_;
    std::optional<std::string> type_;
    std::optional<std::string> name_;
    std::optional<std::string> group_;
    std::vector<std::string> extensions_;
    std::vector<std::string> removed_;
    bool isHidden_ = false;
    bool isVisible_ = false;
};

} // namespace

std::unique_ptr<Command> makeSetEntryCommand() {
    return std::make_unique<SetEntryCommand>();
}

} // namespace projectctl

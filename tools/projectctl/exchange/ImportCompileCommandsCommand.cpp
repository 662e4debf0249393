#include <map>
#include <set>

#include "cli/ArgumentPaths.hpp"
#include "cli/Settings.hpp"
#include "cli/StandardInput.hpp"
#include "exchange/CompileCommands.hpp"
#include "exchange/ImportCommand.hpp"
#include "exchange/ImportCommands.hpp"
#include "git/GitIgnore.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Adds the files of a compilation database, each with a label for the folder of its target.
class ImportCompileCommandsCommand : public ImportCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = declareForm(group, "compile-commands");
        declareFile(*app);
        return app;
    }

protected:
    std::string source(OpenProject& /*project*/) const override { return file().value_or(defaultFile); }

    std::string load(OpenProject& /*project*/) const override {
        return readFileOrInput(file().value_or(defaultFile));
    }

    ImportedItems itemsIn(std::string const& data, OpenProject& project, Unmapped& unmapped) const override {
        ImportedItems result;
        std::map<std::string, ArgumentPaths> folders; // the entries share a few
        for (auto const& entry : readCompileCommands(data)) {
            if (entry.file.empty() || !entry.directory.starts_with('/')) {
                unmapped.add(entry.line, Message("EntryIncomplete"));
                continue;
            }
            auto const folder = fl::filesystem::fromSystem(entry.directory);
            auto const found = folders.try_emplace(entry.directory, folder).first;
            ImportedItem item{entry.line, found->second.absolute(entry.file)};
            if (auto const target = targetFolderOf(entry.output); !target.empty()) {
                item.label = ImportedLabel{u"Target", textOf(target), {}};
            }
            result.push_back(std::move(item));
        }
        return withoutIgnored(std::move(result), project);
    }

private:
    static constexpr char const* defaultFile = "compile_commands.json";

    /// Leaves out files that the build has generated, if git ignores them.
    static ImportedItems withoutIgnored(ImportedItems items, OpenProject& project) {
        if (!settings().sourceControl || !isInGitRepository(project.root())) {
            return items;
        }
        std::set<Path> asked;
        for (auto const& item : items) {
            if (project::metadata::isParent(item.path, project.root())) {
                asked.insert(item.path);
            }
        }
        for (auto const& kept : withoutIgnoredByGit(project.root(), {asked.begin(), asked.end()})) {
            asked.erase(kept);
        }
        std::erase_if(items, [&asked](ImportedItem const& item) { return asked.contains(item.path); });
        return items;
    }
};

} // namespace

std::unique_ptr<Command> makeImportCompileCommandsCommand() {
    return std::make_unique<ImportCompileCommandsCommand>();
}

} // namespace projectctl

#include <string_view>
#include <system_error>

#include "exchange/ImportCommand.hpp"
#include "exchange/ImportCommands.hpp"
#include "git/GitCommand.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Adds the files below the root that git tracks.
class ImportGitCommand : public ImportCommand {
public:
    CLI::App* declare(CLI::App& group) override { return declareForm(group, "git"); }

protected:
    std::string source(OpenProject& /*project*/) const override { return "git"; }

    std::string load(OpenProject& project) const override {
        try {
            auto result = runGit(project.root(), {"ls-files", "-z", "--cached"});
            if (result.exitCode != 0) {
                throw Failure(Message("GitListFails", result.errors.substr(0, result.errors.find('\n'))));
            }
            return std::move(result.output);
        } catch (std::system_error const& error) {
            throw Failure(Message("GitNotRun", error.what()));
        }
    }

    ImportedItems itemsIn(std::string const& data, OpenProject& project, Unmapped& unmapped) const override {
        ImportedItems result;
        std::string previous;
        for (std::string_view rest = data; !rest.empty();) {
            std::string const name(rest.substr(0, rest.find('\0')));
            rest.remove_prefix(name.size() + 1);
            bool const isTwice =
                name == previous; // as long as a merge has conflicts, git lists several versions
            previous = name;
            if (isTwice) {
                continue;
            }
            auto const path = pathFromRoot(project.root(), textOf(name));
            if (path && !project::metadata::isParent(*path, project.store().getMetadataRoot())) {
                result.push_back({0, *path});
            } else if (!path) {
                unmapped.add(0, Message("NotAPath", textOf(name)));
            }
        }
        return result;
    }
};

} // namespace

std::unique_ptr<Command> makeImportGitCommand() {
    return std::make_unique<ImportGitCommand>();
}

} // namespace projectctl

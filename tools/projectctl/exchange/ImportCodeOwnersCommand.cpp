#include "cli/StandardInput.hpp"
#include "exchange/CodeOwners.hpp"
#include "exchange/ImportCommand.hpp"
#include "exchange/ImportCommands.hpp"
#include "exchange/OwnerCategory.hpp"
#include "files/DiskFolder.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/FileList.hpp"

namespace projectctl {

namespace {

/// Puts labels for the owners of files on the files of the project.
class ImportCodeOwnersCommand : public ImportCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = declareForm(group, "codeowners");
        declareFile(*app);
        return app;
    }

protected:
    std::string source(OpenProject& project) const override {
        return file() ? *file() : bytesOf(defaultFile(project.root()).native());
    }

    std::string load(OpenProject& project) const override { return readFileOrInput(source(project)); }

    ImportedItems itemsIn(std::string const& data, OpenProject& project, Unmapped& unmapped) const override {
        CodeOwners const owners(data);
        for (auto const& [line, problem] : owners.badLines()) {
            unmapped.add(line, problem);
        }
        ImportedItems result;
        FileList(project).visit(project.root(), [&](FileList::File const& file) {
            auto const* const rule = file.kind == Kind::File ? owners.ruleOf(file.path) : nullptr;
            if (rule != nullptr) {
                for (auto const& owner : rule->owners) {
                    result.push_back({rule->line, project.root() / Path(file.path),
                                      ImportedLabel{ownerCategory, textOf(owner), {}}});
                }
            }
        });
        return result;
    }

private:
    static Path defaultFile(Path const& root) {
        for (auto const* const name : {u".github/CODEOWNERS", u"CODEOWNERS", u"docs/CODEOWNERS"}) {
            if (auto file = root / Path(name); isOnDisk(file)) {
                return file;
            }
        }
        throw Failure(Message("CodeOwnersMissing"));
    }
};

} // namespace

std::unique_ptr<Command> makeImportCodeOwnersCommand() {
    return std::make_unique<ImportCodeOwnersCommand>();
}

} // namespace projectctl

#include <algorithm>
#include <functional>
#include <string>
#include <vector>

#include "cli/ShownPaths.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/references/FolderReference.hpp"
#include "references/ReferenceCommands.hpp"

namespace projectctl {

namespace {

using project::management::FolderReference;

class ListReferencesCommand : public ProjectCommand {
public:
    explicit ListReferencesCommand(ReferenceList const& list) : list_(list) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list");
        auto* const json = app->add_flag("--json", isJson_);
        app->add_flag("-0,--null", isNullEnded_)->excludes(json);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto references = list_.manager(project).getReferences();
        std::ranges::stable_sort(references, std::less<>(), &FolderReference::getLocation);
        isJson_ ? writeJson(references) : writePaths(references, project.root());
        return 0;
    }

    bool isListing() const override { return true; }

private:
    static void writeJson(std::vector<FolderReference> const& references) {
        JsonRows rows(json::referenceList, "references");
        for (auto const& reference : references) {
            rows.begin();
            rows.addText("path", reference.getStoredPath());
            rows.addText("type", reference.getType());
            rows.addText("folder", reference.getLocation().native());
            rows.addText("uuid", reference.getUUID());
        }
        rows.finish();
    }

    void writePaths(std::vector<FolderReference> const& references, Path const& root) const {
        ShownPaths shown(root);
        for (auto const& reference : references) {
            auto const path = shown.of(reference.getStoredPath());
            if (isNullEnded_) {
                appendBytes(output().text(), path);
                output().text() += '\0';
            } else {
                output().name(path);
                output().text() += '\n';
            }
        }
    }

    ReferenceList const& list_;
    bool isJson_ = false;
    bool isNullEnded_ = false;
};

} // namespace

std::unique_ptr<Command> makeListReferencesCommand(ReferenceList const& list) {
    return std::make_unique<ListReferencesCommand>(list);
}

} // namespace projectctl

#include "labels/FileLabelCommand.hpp"

#include <algorithm>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/files/LabelIDSet.hpp"

namespace projectctl {

int FileLabelCommand::run(OpenProject& project) {
    auto const paths = paths_.read();
    Progress const progress("Labelling " + std::to_string(paths.size()) + " files and folders");
    ProjectTransaction transaction(project);
    for (auto const& path : paths) {
        project.requireInProject(path);
    }
    auto const confirmation = change(project, paths);
    if (dryRun_.end(transaction, project)) {
        output().say(confirmation);
    }
    return 0;
}

void FileLabelCommand::declareArguments(CLI::App& app) {
    completes(takeText(app, "CATEGORY", category_), Completes::Categories)->required();
    completes(takeText(app, "LABEL", label_), Completes::Labels)->required();
    paths_.declare(app);
    dryRun_.declare(app);
}

std::size_t FileLabelCommand::countOn(OpenProject& project, Path const& path,
                                      project::management::Label const& label) {
    project::management::LabelIDSet const wanted(label.getCategory(), label.getLabelIdentifier());
    return static_cast<std::size_t>(std::ranges::count(project.files().getLabelIDSets(path), wanted));
}

} // namespace projectctl

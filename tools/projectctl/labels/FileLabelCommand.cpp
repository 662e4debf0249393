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
    Progress const progress(Message("ProgressLabels", paths.size()));
    auto const layer = layers_.forChange(project, *category_);
    if (layer.isPersonal() && !dryRun_.isOn()) { // without the lock of the project
        LabelLayer::Guard const guard(layer);
        output().say(changeAll(project, layer, paths));
        return 0;
    }
    ProjectTransaction transaction(project);
    auto const confirmation = changeAll(project, layer, paths);
    if (dryRun_.end(transaction, project)) {
        output().say(confirmation);
    }
    return 0;
}

Message FileLabelCommand::changeAll(OpenProject& project, LabelLayer const& layer,
                                    std::vector<Path> const& paths) const {
    for (auto const& path : paths) {
        project.requireInProject(path);
    }
    return change(project, layer, paths);
}

void FileLabelCommand::declareArguments(CLI::App& app) {
    completes(takeText(app, "CATEGORY", category_), Completes::Categories)->required();
    completes(takeText(app, "LABEL", label_), Completes::Labels)->required();
    paths_.declare(app);
    layers_.declare(app);
    dryRun_.declare(app);
}

std::size_t FileLabelCommand::countOn(LabelLayer const& layer, Path const& path,
                                      project::management::Label const& label) {
    project::management::LabelIDSet const wanted(label.getCategory(), label.getLabelIdentifier());
    return static_cast<std::size_t>(std::ranges::count(layer.files().getLabelIDSets(path), wanted));
}

} // namespace projectctl

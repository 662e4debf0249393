#include <algorithm>
#include <string>
#include <vector>

#include "labels/FileLabelCommand.hpp"
#include "labels/LabelCommands.hpp"
#include "project/LabelNames.hpp"
#include "project/files/FileLabel.hpp"

namespace projectctl {

namespace {

/// Removes a label from files, however many times they have it.
class TakeLabelCommand : public FileLabelCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("take");
        declareArguments(*app);
        return app;
    }

private:
    Message change(OpenProject& project, LabelLayer const& layer,
                   std::vector<Path> const& paths) const override {
        auto const label = LabelNames(layer.labels()).labelEvenIfDeleted(category(), this->label());
        std::vector<Path> labelled;
        std::size_t most = 0;
        for (auto const& path : paths) {
            if (std::size_t const count = countOn(layer, path, label); count > 0) {
                labelled.push_back(path);
                most = std::max(most, count);
            }
        }
        if (!layer.isPersonal()) { // git has no personal labels to restore
            project.changedFiles().labelled += labelled.size();
        }
        if (!labelled.empty()) {
            layer.files().removeLabels(labelled, std::vector(most, label)); // each element removes one
        }
        return Message("LabelTaken", labelled.size());
    }
};

} // namespace

std::unique_ptr<Command> makeTakeLabelCommand() {
    return std::make_unique<TakeLabelCommand>();
}

} // namespace projectctl

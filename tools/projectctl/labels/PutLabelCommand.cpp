#include <string>
#include <vector>

#include "labels/FileLabelCommand.hpp"
#include "labels/LabelCommands.hpp"
#include "project/LabelNames.hpp"
#include "project/files/FileLabel.hpp"

namespace projectctl {

namespace {

/// Puts a label on files. A file that already has the label is left alone: it would get the label twice.
class PutLabelCommand : public FileLabelCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("put");
        declareArguments(*app);
        return app;
    }

private:
    Message change(OpenProject& project, LabelLayer const& layer,
                   std::vector<Path> const& paths) const override {
        auto const label = LabelNames(layer.labels()).label(category(), this->label());
        auto lacking = paths;
        std::erase_if(lacking, [&](Path const& path) { return countOn(layer, path, label) > 0; });
        auto const replaced = layer.files().addLabels(lacking, {label});
        if (!layer.isPersonal()) { // git has no personal labels to restore
            project.changedFiles().labelled += lacking.size();
        }
        return replaced.empty() ? Message("LabelPut", lacking.size())
                                : Message("LabelPutReplacing", lacking.size(), replaced.size());
    }
};

} // namespace

std::unique_ptr<Command> makePutLabelCommand() {
    return std::make_unique<PutLabelCommand>();
}

} // namespace projectctl

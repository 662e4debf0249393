#include <algorithm>
#include <string_view>
#include <vector>

#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "labels/LabelCommands.hpp"
#include "output/JsonRows.hpp"
#include "output/Output.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"
#include "project/files/FileLabel.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

using project::management::FileLabel;

/// Shows the labels of files, each label once, with its data if it has any.
class ShowLabelsCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("show");
        paths_.declare(*app);
        layers_.declare(*app);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        auto const paths = paths_.read();
        project.warnOfDamage();
        auto const guards = layers_.readGuards(project);
        ShownPaths shown(project.root());
        JsonRows rows(json::labelShow, "labels");
        for (auto const& path : paths) {
            std::u16string const fromRoot = project::metadata::getRelativePath(project.root(), path);
            project.requireInProject(path);
            auto const shownPath = paths.size() > 1 ? shown.of(fromRoot) : std::u16string_view();
            for (auto const& layer : layers_.searched(project)) {
                for (auto const& label : labelsOf(project, layer, path)) {
                    isJson_ ? writeJson(rows, fromRoot, layer, label) : writeLine(shownPath, layer, label);
                }
            }
        }
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

    bool isListing() const override { return true; }

private:
    /// The file manager lists a label that has data twice, first with the data and then without.
    static std::vector<FileLabel> labelsOf(OpenProject& project, LabelLayer const& layer, Path const& path) {
        std::vector<FileLabel> result;
        for (auto const& label : readLabels(project, layer, path)) {
            auto const isSame = [&label](FileLabel const& other) {
                return other.getUUID() == label.getUUID() &&
                       other.getCategory().getUUID() == label.getCategory().getUUID();
            };
            if (std::ranges::none_of(result, isSame)) {
                result.push_back(label);
            }
        }
        return result;
    }

    static std::vector<FileLabel> readLabels(OpenProject& project, LabelLayer const& layer,
                                             Path const& path) {
        return path == project.root() ? std::vector<FileLabel>() : layer.files().getLabels(path);
    }

    static void writeJson(JsonRows& rows, std::u16string const& path, LabelLayer const& layer,
                          FileLabel const& label) {
        rows.begin();
        rows.addText("path", path);
        rows.addNamed("category", label.getCategory().getName(), label.getCategory().getUUID());
        rows.addNamed("label", label.getLabelIdentifier().getName(), label.getUUID());
        rows.addText("data", label.getData());
        rows.addFlag("personal", layer.isPersonal());
    }

    /// @param path empty if the line should not show it.
    static void writeLine(std::u16string_view path, LabelLayer const& layer, FileLabel const& label) {
        if (!path.empty()) {
            output().pathBesideData(path);
            output().text() += ": ";
        }
        output().name(label.getCategory().getName());
        output().text() += ": ";
        output().name(label.getLabelIdentifier().getName());
        if (!label.getData().empty()) {
            output().text() += " = ";
            output().name(label.getData());
        }
        if (layer.isPersonal()) {
            output().text() += " (personal)";
        }
        output().text() += '\n';
        output().flushWhenLarge();
    }

    PathArguments paths_;
    LayerOptions layers_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeShowLabelsCommand() {
    return std::make_unique<ShowLabelsCommand>();
}

} // namespace projectctl

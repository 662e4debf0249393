#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "cli/CodedFailure.hpp"
#include "cli/Completes.hpp"
#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "files/Commands.hpp"
#include "output/Kind.hpp"
#include "output/NameForms.hpp"
#include "output/Progress.hpp"
#include "project/FoundFiles.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::session::LabelChoice;
using project::session::Query;

/// Lists the files and folders of the project that meet all conditions of its options; by default all of
/// them.
class ListCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("list");
        completes(takeTexts(*app, "PATH", paths_), Completes::ProjectPaths);
        declareConditions(*app);
        form_.declare(*app, true);
        return app;
    }

    int run(OpenProject& project) override {
        Progress const progress(Message("ProgressList"));
        Query query;
        query.paths = absolutePaths(paths_);
        project
            .warnOfDamage(); // first: this reads the text, and the list need not check it for changes again
        FileList const files(project);
        for (auto const& path : query.paths) {
            project.requireInProject(path);
        }
        query.labels = choicesOf(project, labels_);
        query.absentLabels = choicesOf(project, absentLabels_);
        query.layers = layers_.layers();
        query.kind = kind();
        query.glob = glob_ ? std::optional(textOf(*glob_)) : std::nullopt;
        query.isEntryPoint = isEntryPoint_;
        query.isUnlabelled = isUnlabelled_;
        form_.write(project, files, query);
        return 0;
    }

    bool isListing() const override { return true; }

private:
    void declareConditions(CLI::App& app) {
        auto* const label = takeTexts(app, "--label", labels_);
        completes(label, Completes::LabelChoices)->allow_extra_args(false);
        auto* const noLabel = takeTexts(app, "--no-label", absentLabels_);
        completes(noLabel, Completes::LabelChoices)->allow_extra_args(false);
        completes(takeText(app, "--kind", kind_), Completes::Kinds);
        takeText(app, "--glob", glob_);
        app.add_flag("--entry-points", isEntryPoint_);
        app.add_flag("--unlabelled", isUnlabelled_);
        layers_.declare(app);
    }

    std::vector<LabelChoice> choicesOf(OpenProject& project,
                                       std::vector<std::string> const& arguments) const {
        std::vector<LabelChoice> result;
        result.reserve(arguments.size());
        for (auto const& argument : arguments) {
            std::size_t const equals = argument.find('=');
            result.push_back(equals == std::string::npos ? layers_.choice(project, argument, std::nullopt)
                                                         : layers_.choice(project, argument.substr(0, equals),
                                                                          argument.substr(equals + 1)));
        }
        return result;
    }

    std::optional<Kind> kind() const {
        if (!kind_) {
            return std::nullopt;
        }
        if (*kind_ != "file" && *kind_ != "folder") {
            throw WrongUse(Message("KindUnknown", *kind_));
        }
        return *kind_ == "file" ? Kind::File : Kind::Folder;
    }

    std::vector<std::string> paths_;
    std::vector<std::string> labels_;
    std::vector<std::string> absentLabels_;
    std::optional<std::string> kind_;
    std::optional<std::string> glob_;
    bool isEntryPoint_ = false;
    bool isUnlabelled_ = false;
    LayerOptions layers_;
    FoundFiles form_;
};

} // namespace

std::unique_ptr<Command> makeListCommand() {
    return std::make_unique<ListCommand>();
}

} // namespace projectctl

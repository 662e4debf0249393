#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "project/FoundFiles.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Lists the files that have a label, or any label of a category: the short form of `list --label`.
class FindLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("find");
        completes(takeText(*app, "CATEGORY", category_), Completes::Categories)->required();
        completes(takeText(*app, "LABEL", label_), Completes::Labels);
        layers_.declare(*app);
        form_.declare(*app, false);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        FileList const files(project);
        project::session::Query query;
        query.labels.push_back(layers_.choice(project, *category_, label_));
        query.layers = layers_.layers();
        form_.write(project, files, query);
        return 0;
    }

    bool isListing() const override { return true; }

private:
    std::optional<std::string> category_;
    std::optional<std::string> label_;
    LayerOptions layers_;
    FoundFiles form_;
};

} // namespace

std::unique_ptr<Command> makeFindLabelCommand() {
    return std::make_unique<FindLabelCommand>();
}

} // namespace projectctl

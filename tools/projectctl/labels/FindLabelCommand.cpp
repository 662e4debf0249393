#include <algorithm>
#include <optional>
#include <string>

#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "labels/LabelNames.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/FileList.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace {

namespace fileSchema = project::metadata::schema::files;

/// Lists the files that have a label, or any label of a category. It reads the nodes of the file list itself:
/// asking the file manager for the labels of each file would take ten times as long.
class FindLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(
            "find", "List the files and folders that have a label, in the same order as 'projectctl list'");
        takeText(*app, "CATEGORY", category_, "The category's name or UUID")->required();
        takeText(*app, "LABEL", label_, "The label's name or UUID (default: any label of the category)");
        auto* const json =
            app->add_flag("--json", isJson_, "Write a JSON array of objects with \"path\" and \"kind\"");
        app->add_flag("-0,--null", isNullEnded_, "End each path with a zero byte")->excludes(json);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        FileList const list(project);
        findUUIDs(LabelNames(project.manager().getLabelManager()));
        ShownPaths shown(project.root());
        list.visit(project.root(), [this, &shown](FileList::File const& file) {
            if (hasLabel(file.node)) {
                isJson_ ? writeJson(file) : writePath(shown.of(file.path));
            }
        });
        if (isJson_) {
            rows_.finishOutput();
        }
        return 0;
    }

private:
    void findUUIDs(LabelNames names) {
        if (label_) {
            auto const label = names.label(*category_, *label_);
            categoryUUID_ = label.getCategory().getUUID();
            labelUUID_ = label.getUUID();
        } else {
            categoryUUID_ = names.category(*category_).getUUID();
        }
    }

    bool hasLabel(project::metadata::MetadataNode const& node) const {
        return std::ranges::any_of(node.getChildren(), [this](auto const& category) {
            return category->getType() == fileSchema::categoryType &&
                   category->get(fileSchema::categoryUUIDKey) == categoryUUID_ &&
                   std::ranges::any_of(category->getChildren(), [this](auto const& label) {
                       return label->getType() == fileSchema::labelType &&
                              isWanted(label->get(fileSchema::labelUUIDKey));
                   });
        });
    }

    bool isWanted(std::u16string const& uuid) const {
        return labelUUID_.empty() ? !uuid.empty() : uuid == labelUUID_;
    }

    void writeJson(FileList::File const& file) {
        rows_.begin();
        rows_.addFile(file.path, file.kind);
        output().flushWhenLarge();
    }

    void writePath(std::u16string_view path) const {
        if (isNullEnded_) {
            appendBytes(output().text(), path);
            output().text() += '\0';
        } else {
            output().name(path);
            output().text() += '\n';
        }
        output().flushWhenLarge();
    }

    std::optional<std::string> category_;
    std::optional<std::string> label_;
    bool isJson_ = false;
    bool isNullEnded_ = false;
    std::u16string categoryUUID_;
    std::u16string labelUUID_; ///< empty for any
    JsonRows rows_;
};

} // namespace

std::unique_ptr<Command> makeFindLabelCommand() {
    return std::make_unique<FindLabelCommand>();
}

} // namespace projectctl

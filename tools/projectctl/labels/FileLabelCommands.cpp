#include <algorithm>
#include <optional>
#include <string>

#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "labels/LabelCommands.hpp"
#include "labels/LabelNames.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/FileList.hpp"
#include "project/ProjectCommand.hpp"
#include "project/Schema.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

using project::management::FileLabel;
using project::management::FileManager;
using project::management::Label;
using project::management::LabelIDSet;

LabelIDSet idsOf(Label const& label) {
    return {label.getCategory(), label.getLabelIdentifier()};
}

/// How often a label stands on a file.
std::size_t countOn(FileManager& files, Path const& path, Label const& label) {
    return static_cast<std::size_t>(std::ranges::count(files.getLabelIDSets(path), idsOf(label)));
}

/// What putting a label on files and taking it off have in common: the label and the files.
class FileLabelCommand : public ProjectCommand {
public:
    int run(OpenProject& project) override {
        auto const paths = paths_.read();
        Progress const progress("Labelling " + std::to_string(paths.size()) + " files and folders");
        auto const guard = project.store().acquireWriteLock();
        for (auto const& path : paths) {
            project.requireInProject(path);
        }
        change(project, paths);
        return 0;
    }

protected:
    /// @param paths in the project.
    virtual void change(OpenProject& project, std::vector<Path> const& paths) const = 0;

    void declareArguments(CLI::App& app, std::string const& use) {
        takeText(app, "CATEGORY", category_, "The category's name or UUID")->required();
        takeText(app, "LABEL", label_, "The label's name or UUID")->required();
        paths_.declare(app, use);
    }

    std::string const& category() const { return *category_; }

    std::string const& label() const { return *label_; }

private:
    std::optional<std::string> category_;
    std::optional<std::string> label_;
    PathArguments paths_;
};

/// Puts a label on files. On a file that bears it already it is not put again, where it would stand twice.
class PutLabelCommand : public FileLabelCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(
            "put", "Put a label on files and folders of the project, all in one step; in a single-valued "
                   "category it takes the place of the one that was there");
        declareArguments(*app, "What to put it on");
        return app;
    }

private:
    void change(OpenProject& project, std::vector<Path> const& paths) const override {
        auto const label = LabelNames(project.manager().getLabelManager()).label(category(), this->label());
        auto lacking = paths;
        std::erase_if(lacking, [&](Path const& path) { return countOn(project.files(), path, label) > 0; });
        auto const displaced = project.files().addLabels(lacking, {label});
        output().say(
            "put on " + std::to_string(lacking.size()) +
            (displaced.empty() ? "" : ", in place of " + std::to_string(displaced.size()) + " others"));
    }
};

/// Takes a label off files, however often it stands there.
class TakeLabelCommand : public FileLabelCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(
            "take",
            "Take a label off files and folders of the project, all in one step; what is left on them "
            "of a deleted label goes by its UUIDs");
        declareArguments(*app, "What to take it off");
        return app;
    }

private:
    void change(OpenProject& project, std::vector<Path> const& paths) const override {
        auto const label =
            LabelNames(project.manager().getLabelManager()).labelOrWhatIsLeft(category(), this->label());
        std::vector<Path> bearing;
        std::size_t most = 0;
        for (auto const& path : paths) {
            if (auto const count = countOn(project.files(), path, label); count > 0) {
                bearing.push_back(path);
                most = std::max(most, count);
            }
        }
        if (!bearing.empty()) {
            project.files().removeLabels(bearing, std::vector(most, label)); // each takes one off
        }
        output().say("taken off " + std::to_string(bearing.size()));
    }
};

/// Shows the labels on files, each label once, with its data if it has any.
class ShowLabelsCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("show", "Show the labels on files and folders of the project");
        paths_.declare(*app, "What to look at");
        app->add_flag("--json", json_, "As a JSON array of objects, one a label, with the UUIDs");
        return app;
    }

    int run(OpenProject& project) override {
        auto const paths = paths_.read();
        project.warnOfDamage();
        auto const guard = project.store().acquireReadLock();
        JsonRows rows;
        for (auto const& path : paths) {
            auto const relative = project::metadata::getRelativePath(project.root(), path);
            for (auto const& label : labelsOf(project, path)) {
                json_ ? writeJson(rows, relative, label) : writeLine(relative, label, paths.size() > 1);
            }
        }
        if (json_) {
            rows.finishOutput();
        }
        return 0;
    }

private:
    /// The file manager gives a label that has data twice, with the data first.
    static std::vector<FileLabel> labelsOf(OpenProject& project, Path const& path) {
        std::vector<FileLabel> result;
        for (auto const& label : readLabels(project, path)) {
            auto const isSame = [&label](FileLabel const& other) { return idsOf(other) == idsOf(label); };
            if (std::ranges::none_of(result, isSame)) {
                result.push_back(label);
            }
        }
        return result;
    }

    static std::vector<FileLabel> readLabels(OpenProject& project, Path const& path) {
        project.requireInProject(path);
        return path == project.root() ? std::vector<FileLabel>() : project.files().getLabels(path);
    }

    static void writeJson(JsonRows& rows, std::u16string const& path, FileLabel const& label) {
        rows.begin();
        rows.addText("path", path);
        rows.addText("category", label.getCategory().getName());
        rows.addText("categoryUuid", label.getCategory().getUUID());
        rows.addText("label", label.getLabelIdentifier().getName());
        rows.addText("labelUuid", label.getUUID());
        rows.addText("data", label.getData());
    }

    static void writeLine(std::u16string const& path, FileLabel const& label, bool withPath) {
        if (withPath) {
            output().name(path);
            output().text() += ": ";
        }
        output().name(label.getCategory().getName());
        output().text() += ": ";
        output().name(label.getLabelIdentifier().getName());
        if (!label.getData().empty()) {
            output().text() += " = ";
            output().name(label.getData());
        }
        output().text() += '\n';
        output().settle();
    }

    PathArguments paths_;
    bool json_ = false;
};

/// Lists the files that bear a label, or any label of a category.
class FindLabelCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(
            "find", "List the files and folders that bear a label, in the order of list");
        takeText(*app, "CATEGORY", category_, "The category's name or UUID")->required();
        takeText(*app, "LABEL", label_, "The label's name or UUID; any label of the category by default");
        auto* const json =
            app->add_flag("--json", json_, "As a JSON array of objects with \"path\" and \"kind\"");
        app->add_flag("-0,--null", null_, "With a zero byte behind each path")->excludes(json);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        FileList const list(project);
        LabelNames names(project.manager().getLabelManager());
        if (label_) {
            auto const label = names.label(*category_, *label_);
            categoryUUID_ = label.getCategory().getUUID();
            labelUUID_ = label.getUUID();
        } else {
            categoryUUID_ = names.category(*category_).getUUID();
        }
        list.visit(project.root(), [this](FileList::File const& file) {
            if (bears(file.node)) {
                write(file);
            }
        });
        if (json_) {
            rows_.finishOutput();
        }
        return 0;
    }

private:
    bool bears(project::metadata::MetadataNode const& node) const {
        return std::ranges::any_of(node.getChildren(), [this](auto const& category) {
            return category->getType() == schema::category &&
                   category->get(schema::uuidKey) == categoryUUID_ &&
                   std::ranges::any_of(category->getChildren(), [this](auto const& label) {
                       return label->getType() == schema::label && isWanted(label->get(schema::uuidKey));
                   });
        });
    }

    bool isWanted(std::u16string const& uuid) const {
        return labelUUID_.empty() ? !uuid.empty() : uuid == labelUUID_;
    }

    void write(FileList::File const& file) {
        if (json_) {
            rows_.begin();
            rows_.addFile(file.path, file.kind);
        } else if (null_) {
            appendBytes(output().text(), file.path);
            output().text() += '\0';
        } else {
            output().name(file.path);
            output().text() += '\n';
        }
        output().settle();
    }

    std::optional<std::string> category_;
    std::optional<std::string> label_;
    bool json_ = false;
    bool null_ = false;
    std::u16string categoryUUID_;
    std::u16string labelUUID_; ///< empty for any
    JsonRows rows_;
};

} // namespace

std::unique_ptr<Command> makePutLabelCommand() {
    return std::make_unique<PutLabelCommand>();
}

std::unique_ptr<Command> makeTakeLabelCommand() {
    return std::make_unique<TakeLabelCommand>();
}

std::unique_ptr<Command> makeShowLabelsCommand() {
    return std::make_unique<ShowLabelsCommand>();
}

std::unique_ptr<Command> makeFindLabelCommand() {
    return std::make_unique<FindLabelCommand>();
}

} // namespace projectctl

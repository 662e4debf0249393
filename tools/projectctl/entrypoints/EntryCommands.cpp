#include <algorithm>
#include <optional>
#include <string>
#include <utility>

#include "cli/ArgumentPaths.hpp"
#include "cli/CommandGroup.hpp"
#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "entrypoints/Commands.hpp"
#include "entrypoints/Groups.hpp"
#include "output/Failure.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/ProjectException.hpp"

namespace projectctl {

namespace {

using project::management::EntryPoint;
using project::management::EntryPointDefinition;
using project::management::EntryPointManager;
using project::metadata::getRelativePath;
using ZEPHRA::project::management::FileNotInProject;

Path absolutePath(std::string const& argument) {
    return ArgumentPaths(workingFolder()).absolute(argument);
}

/// What is stored of a path has "/" for every backslash, and so cannot be found again.
void requireNoBackslash(Path const& root, Path const& file) {
    auto const relative = getRelativePath(root, file);
    if (relative.find(u'\\') != std::u16string::npos) {
        throw Failure(
            "an entry point of " + inQuotes(relative) +
            " could not be found again, because of the backslash in its name. Rename the file first");
    }
}

/// Makes a file an entry point, or changes the entry point that it is.
class SetEntryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(
            "set", "Make a file of the project an entry point, or change what is given of the one it is");
        takeText(*app, "FILE", file_, "A file of the project")->required();
        takeText(*app, "--type", type_, "Basic (by default), Startup, Shutdown or Batch_Job");
        takeText(*app, "--name", name_,
                 "What people call it; the file's name without its extension by default");
        auto* const hidden = app->add_flag("--hidden", hidden_, "Do not show it to people");
        app->add_flag("--visible", visible_, "Show it to people, as by default")->excludes(hidden);
        takeText(*app, "--group", group_, "The group's name or UUID; the default group by default");
        takeTexts(*app, "--extension", extensions_, "KEY=VALUE, to be kept with it; may be given again")
            ->allow_extra_args(false);
        takeTexts(*app, "--no-extension", removed_, "KEY, no longer to be kept with it; may be given again")
            ->allow_extra_args(false);
        return app;
    }

    int run(OpenProject& project) override {
        auto const file = absolutePath(*file_);
        requireNoBackslash(project.root(), file);
        auto const guard = project.store().acquireWriteLock();
        auto& entryPoints = project.manager().getEntryPointManager();
        auto const present = entryPoints.getEntryPoint(file);
        if (!present) {
            project::exception::raise(FileNotInProject(file.native()));
        }
        EntryPointDefinition entry(*present);
        change(entry, entryPoints);
        entryPoints.setEntryPoint(entry);
        return 0;
    }

private:
    void change(EntryPointDefinition& entry, EntryPointManager& entryPoints) const {
        if (type_) {
            entry.setType(project::management::getFromName(textOf(*type_)));
        }
        if (name_) {
            entry.setName(textOf(*name_));
        }
        if (hidden_ || visible_) {
            entry.setVisible(visible_);
        }
        if (group_) {
            entry.setGroup(Groups(entryPoints).named(*group_));
        }
        for (auto const& key : removed_) {
            entry.removeExtensionData(textOf(key));
        }
        for (auto const& pair : extensions_) {
            auto const equals = pair.find('=');
            if (equals == std::string::npos) {
                throw Failure('"' + pair + "\" is no extension. Give it as KEY=VALUE");
            }
            entry.setExtensionData(textOf(pair.substr(0, equals)), textOf(pair.substr(equals + 1)));
        }
    }

    std::optional<std::string> file_;
    std::optional<std::string> type_;
    std::optional<std::string> name_;
    std::optional<std::string> group_;
    std::vector<std::string> extensions_;
    std::vector<std::string> removed_;
    bool hidden_ = false;
    bool visible_ = false;
};

/// The entry points as a list of objects.
class EntryRows {
public:
    explicit EntryRows(Path const& root) : root_(root) {}

    void add(EntryPoint const& entry) {
        rows_.begin();
        rows_.addText("path", getRelativePath(root_, entry.getFile()));
        rows_.addText("uuid", entry.getUUID());
        rows_.addText("type", toString(entry.getType()));
        rows_.addText("name", entry.getName());
        rows_.addFlag("visible", entry.isVisible());
        if (auto const group = entry.getGroup()) {
            rows_.addText("group", group->getName());
            rows_.addText("groupUuid", group->getUUID());
        }
        JsonRows::Texts extensions;
        for (auto const& key : entry.getExtensionKeys()) {
            extensions.emplace_back(key, entry.getExtensionData(key).value_or(u""));
        }
        rows_.addTexts("extensions", extensions);
    }

    void finish() { rows_.finishOutput(); }

private:
    Path const& root_;
    JsonRows rows_;
};

class ListEntriesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app =
            group.add_subcommand("list", "List the entry points of the project, by their files");
        app->add_flag("--json", json_, "As a JSON array of objects, with all that is kept of each");
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto entries = project.manager().getEntryPointManager().getEntryPoints();
        std::stable_sort(entries.begin(), entries.end(), [](auto const& left, auto const& right) {
            return left->getFile() < right->getFile();
        });
        EntryRows rows(project.root());
        for (auto const& entry : entries) {
            json_ ? rows.add(*entry) : writeLine(project.root(), *entry);
        }
        if (json_) {
            rows.finish();
        }
        return 0;
    }

private:
    /// For instance "src/main.cpp: Startup, main (hidden)".
    static void writeLine(Path const& root, EntryPoint const& entry) {
        output().name(getRelativePath(root, entry.getFile()));
        output().text() += ": ";
        output().name(toString(entry.getType()));
        output().text() += ", ";
        output().name(entry.getName());
        output().text() += entry.isVisible() ? "\n" : " (hidden)\n";
        output().settle();
    }

    bool json_ = false;
};

class ShowEntryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("show", "Show all that is kept of the entry point of a file");
        takeText(*app, "FILE", file_, "A file of the project")->required();
        app->add_flag("--json", json_, "As a JSON array of one object");
        return app;
    }

    int run(OpenProject& project) override {
        auto const file = absolutePath(*file_);
        project.warnOfDamage();
        auto const guard = project.store().acquireReadLock();
        project.requireInProject(file);
        auto const entry = project.manager().getEntryPointManager().getEntryPoint(file);
        if (entry->getUUID().empty()) {
            throw Failure('"' + shown(file) + "\" is no entry point. 'projectctl entry set' makes it one");
        }
        if (json_) {
            EntryRows rows(project.root());
            rows.add(*entry);
            rows.finish();
        } else {
            writeLines(*entry);
        }
        return 0;
    }

private:
    static void writeLine(std::string const& what, std::u16string const& text) {
        output().text() += what + ": ";
        output().name(text);
        output().text() += '\n';
    }

    static void writeLines(EntryPoint const& entry) {
        writeLine("name", entry.getName());
        writeLine("type", toString(entry.getType()));
        writeLine("visible", entry.isVisible() ? u"yes" : u"no");
        if (auto const group = entry.getGroup()) {
            writeLine("group", group->getName());
        }
        for (auto const& key : entry.getExtensionKeys()) {
            output().text() += "extension ";
            output().name(key);
            writeLine("", entry.getExtensionData(key).value_or(u""));
        }
        writeLine("uuid", entry.getUUID());
    }

    std::optional<std::string> file_;
    bool json_ = false;
};

class RemoveEntryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app =
            group.add_subcommand("remove", "Let files be no entry points any more; they stay in the project");
        paths_.declare(*app, "The files");
        return app;
    }

    int run(OpenProject& project) override {
        auto const files = paths_.read();
        auto const guard = project.store().acquireWriteLock();
        for (auto const& file : files) { // all of them, before the first is changed
            project.requireInProject(file);
        }
        for (auto const& file : files) {
            project.manager().getEntryPointManager().removeEntryPoint(file);
        }
        return 0;
    }

private:
    PathArguments paths_;
};

} // namespace

std::unique_ptr<Command> makeEntryCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(std::make_unique<SetEntryCommand>());
    members.push_back(std::make_unique<ListEntriesCommand>());
    members.push_back(std::make_unique<ShowEntryCommand>());
    members.push_back(std::make_unique<RemoveEntryCommand>());
    return std::make_unique<CommandGroup>(
        "entry", "Make files entry points, and list and remove entry points", std::move(members));
}

} // namespace projectctl

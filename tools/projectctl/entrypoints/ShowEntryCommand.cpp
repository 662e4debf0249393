#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "entrypoints/EntryCommands.hpp"
#include "entrypoints/EntryRows.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::EntryPoint;

class ShowEntryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("show");
        completes(takeText(*app, "FILE", file_), Completes::EntryPoints)->required();
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        auto const file = absolutePath(*file_);
        project.warnOfDamage();
        auto const guard = project.store().acquireReadLock();
        project.requireInProject(file);
        auto const entry = project.manager().getEntryPointManager().getEntryPoint(file);
        if (entry->getUUID().empty()) {
            throw Failure(Message("NotAnEntryPoint", ShownPaths(project.root()).ofAbsolute(file)));
        }
        isJson_ ? writeJson(project.root(), *entry) : writeLines(*entry);
        return 0;
    }

    bool isListing() const override { return true; }

private:
    static void writeJson(Path const& root, EntryPoint const& entry) {
        EntryRows rows(root);
        rows.add(entry);
        rows.finish();
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

    static void writeLine(std::string const& key, std::u16string const& value) {
        output().text() += key + ": ";
        output().name(value);
        output().text() += '\n';
    }

    std::optional<std::string> file_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeShowEntryCommand() {
    return std::make_unique<ShowEntryCommand>();
}

} // namespace projectctl

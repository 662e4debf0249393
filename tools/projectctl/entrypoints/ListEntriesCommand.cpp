#include <algorithm>

#include "cli/ShownPaths.hpp"
#include "entrypoints/EntryCommands.hpp"
#include "entrypoints/EntryRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::EntryPoint;

class ListEntriesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list");
        auto* const json = app->add_flag("--json", isJson_);
        app->add_flag("-0,--null", isNullEnded_)->excludes(json);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        auto entries = project.manager().getEntryPointManager().getEntryPoints();
        std::stable_sort(entries.begin(), entries.end(), [](auto const& left, auto const& right) {
            return left->getFile() < right->getFile();
        });
        EntryRows rows(project.root());
        ShownPaths shown(project.root());
        for (auto const& entry : entries) {
            if (isJson_) {
                rows.add(*entry);
            } else {
                writeLine(shown.ofAbsolute(entry->getFile()), *entry);
            }
        }
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

    bool isListing() const override { return true; }

private:
    /// For example "src/main.cpp: Startup, main (hidden)".
    void writeLine(std::u16string_view file, EntryPoint const& entry) const {
        if (isNullEnded_) {
            appendBytes(output().text(), file);
            output().text() += '\0';
        } else {
            output().pathBesideData(file);
            output().text() += ": ";
            output().name(toString(entry.getType()));
            output().text() += ", ";
            output().name(entry.getName());
            output().text() += entry.isVisible() ? "\n" : " (hidden)\n";
        }
        output().flushWhenLarge();
    }

    bool isJson_ = false;
    bool isNullEnded_ = false;
};

} // namespace

std::unique_ptr<Command> makeListEntriesCommand() {
    return std::make_unique<ListEntriesCommand>();
}

} // namespace projectctl

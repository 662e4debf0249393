#include <optional>
#include <string>

#include "cli/CommandGroup.hpp"
#include "cli/TextArguments.hpp"
#include "entrypoints/Commands.hpp"
#include "entrypoints/Groups.hpp"
#include "output/Failure.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

using project::management::EntryPointGroupDefinition;

class CreateGroupCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create", "Make a group of entry points");
        takeText(*app, "NAME", name_, "The name of the group")->required();
        return app;
    }

    int run(OpenProject& project) override {
        EntryPointGroupDefinition const group(textOf(*name_));
        project.manager().getEntryPointManager().createEntryPointGroup(group);
        return 0;
    }

private:
    std::optional<std::string> name_;
};

class ListGroupsCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list", "List the groups, the default group first");
        app->add_flag("--json", json_, "As a JSON array of objects, with the UUIDs");
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        Groups const groups(project.manager().getEntryPointManager());
        JsonRows rows;
        for (auto const& group : groups.all()) {
            if (json_) {
                rows.begin();
                rows.addText("name", group->getName());
                rows.addText("uuid", group->getUUID());
            } else {
                output().name(group->getName());
                output().text() += '\n';
            }
        }
        if (json_) {
            rows.finishOutput();
        }
        return 0;
    }

private:
    bool json_ = false;
};

class RenameGroupCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("rename", "Give a group another name");
        takeText(*app, "GROUP", group_, "Its name or UUID")->required();
        takeText(*app, "NAME", name_, "The new name")->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& entryPoints = project.manager().getEntryPointManager();
        entryPoints.renameEntryPointGroup(Groups(entryPoints).named(*group_), textOf(*name_));
        return 0;
    }

private:
    std::optional<std::string> group_;
    std::optional<std::string> name_;
};

class DeleteGroupCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(
            "delete", "Delete a group; its entry points stay, without a group. The default group, if it was "
                      "renamed, gets its first name back");
        takeText(*app, "GROUP", group_, "Its name or UUID")->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& entryPoints = project.manager().getEntryPointManager();
        Groups const groups(entryPoints);
        auto const& group = groups.named(*group_);
        if (groups.isDefault(group)) {
            throw Failure("the group " + inQuotes(group.getName()) +
                          " is the one that every project has, and cannot be deleted");
        }
        entryPoints.deleteEntryPointGroup(group);
        return 0;
    }

private:
    std::optional<std::string> group_;
};

} // namespace

std::unique_ptr<Command> makeGroupCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(std::make_unique<CreateGroupCommand>());
    members.push_back(std::make_unique<ListGroupsCommand>());
    members.push_back(std::make_unique<RenameGroupCommand>());
    members.push_back(std::make_unique<DeleteGroupCommand>());
    return std::make_unique<CommandGroup>("group", "Make, list, rename and delete groups of entry points",
                                          std::move(members));
}

} // namespace projectctl

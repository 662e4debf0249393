#include "cli/DeclaredTool.hpp"

#include <algorithm>
#include <string_view>
#include <utility>

#include "cli/CommonOptions.hpp"
#include "cli/HelpFormatter.hpp"
#include "cli/UsageProblem.hpp"
#include "cli/VerbTree.hpp"

namespace projectctl {

namespace {

std::unique_ptr<CLI::App> makeParser() {
    auto parser = std::make_unique<CLI::App>(std::string(), "projectctl");
    parser->formatter(std::make_shared<HelpFormatter>());
    parser->require_subcommand(1);
    return parser;
}

/// Every command whose results have a form in JSON accepts --json. Those that only change the project declare
/// no form of their own.
void declareJson(CLI::App& app) {
    auto const members = membersOf(app);
    std::ranges::for_each(members, [](CLI::App* member) { declareJson(*member); });
    if (members.empty() && app.get_option_no_throw(DeclaredTool::jsonOption) == nullptr) {
        app.add_flag_callback(DeclaredTool::jsonOption, [] {});
    }
}

} // namespace

DeclaredTool::DeclaredTool(CommandList const& verbs) : parser_(makeParser()) {
    declareCommonOptions(*parser_);
    std::ranges::for_each(verbs, [this](auto const& verb) { declare(verb); });
}

DeclaredTool::DeclaredTool(CommandList const& verbs, std::string const& name) : parser_(makeParser()) {
    auto const named = std::ranges::find(verbs, name, &NamedCommand::name);
    if (named != verbs.end()) {
        declare(*named);
    } else {
        *this = DeclaredTool(verbs);
    }
}

void DeclaredTool::declare(NamedCommand const& verb) {
    auto command = verb.make();
    auto* const app = command->declare(*parser_);
    app->group(verb.purpose);
    if (!isHidden(*app)) {
        declareJson(*app);
    }
    declared_.push_back({std::move(command), app});
}

CLI::App const& DeclaredTool::find(std::vector<std::string> const& words) const {
    auto const* found = parser_.get();
    for (auto const& word : words) {
        auto const members =
            found->get_subcommands([&word](auto const* app) { return app->get_name() == word; });
        if (members.empty()) {
            throw WrongUse(unknownVerb(*found, word));
        }
        found = members.front();
    }
    return *found;
}

std::unique_ptr<Command> DeclaredTool::parse(std::vector<std::string> arguments) {
    std::ranges::reverse(arguments); // the order that the parser expects
    parser_->parse(std::move(arguments));
    auto const called = std::ranges::find_if(declared_, [](auto const& item) { return item.app->parsed(); });
    auto member = called->command->takeCalledMember();
    return member ? std::move(member) : std::move(called->command);
}

} // namespace projectctl

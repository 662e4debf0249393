#include "cli/VerbTree.hpp"

namespace projectctl {

std::string wordsOf(CLI::App const& verb) {
    auto const* const parent = verb.get_parent();
    if (parent == nullptr) {
        return {};
    }
    auto const above = wordsOf(*parent);
    return above.empty() ? verb.get_name() : above + ' ' + verb.get_name();
}

std::string callOf(CLI::App const& verb) {
    auto const words = wordsOf(verb);
    return words.empty() ? "projectctl" : "projectctl " + words;
}

CLI::App const& calledVerb(CLI::App const& tool) {
    auto const* verb = &tool;
    for (auto below = tool.get_subcommands(); !below.empty(); below = verb->get_subcommands()) {
        verb = below.front();
    }
    return *verb;
}

} // namespace projectctl

#pragma once

#include <string>

#include <CLI/CLI.hpp>

#include "cli/Command.hpp"

namespace projectctl {

// The verbs as the parser knows them: the tool, its verbs, and the members of groups of verbs.

/// The verbs directly below the tool or a group.
template <typename App>
auto membersOf(App& group) {
    return group.get_subcommands([](auto const*) { return true; });
}

/// Whether help and completion leave a verb out.
inline bool isHidden(CLI::App const& verb) {
    return verb.get_group() == hiddenPurpose;
}

/// The words that call a verb, without the tool's name; empty for the tool itself.
std::string wordsOf(CLI::App const& verb);

/// The words that call a verb, with the tool's name.
std::string callOf(CLI::App const& verb);

/// The verb that parsed arguments call, as far as they could be parsed.
CLI::App const& calledVerb(CLI::App const& tool);

} // namespace projectctl

#pragma once

#include <string>

#include <CLI/CLI.hpp>

#include "cli/VerbDescription.hpp"

namespace projectctl {

/// The help of a verb, in 80 columns: how it is called, its arguments and options, and an example. The help
/// of the whole tool shows its verbs by purpose.
std::string helpOf(VerbDescription const& verb);

/// Lets the parser show this help.
class HelpFormatter : public CLI::FormatterBase {
public:
    std::string make_help(CLI::App const* verb, std::string name, CLI::AppFormatMode mode) const override;
};

} // namespace projectctl

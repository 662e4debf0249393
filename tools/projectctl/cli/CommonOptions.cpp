#include "cli/CommonOptions.hpp"

#include <algorithm>
#include <iterator>

#include "cli/CodedFailure.hpp"
#include "cli/Completes.hpp"
#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "output/Colors.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

constexpr char const* sourceControlOff = "--no-source-control";
constexpr char const* fullNames = "--full-name";
constexpr char const* pagerOff = "--no-pager";
constexpr char const* quiet = "--quiet";
constexpr char const* inFolder = "-C";
constexpr char const* color = "--color";

using Words = std::vector<std::string>;

/// Whether an argument is an option with its value: --option=VALUE.
bool hasValueInside(std::string const& argument, std::string const& option) {
    return option.starts_with("--") && argument.starts_with(option + '=');
}

/// Removes an option with its values, also in the form --option=VALUE.
/// @param missing the error for an option without a value.
Words takeValues(Words& arguments, std::string const& option, char const* missing) {
    Words result;
    auto const isThis = [&option](std::string const& argument) {
        return argument == option || hasValueInside(argument, option);
    };
    for (auto found = std::ranges::find_if(arguments, isThis); found != arguments.end();
         found = std::ranges::find_if(arguments, isThis)) {
        if (*found != option) {
            result.push_back(found->substr(option.size() + 1));
            arguments.erase(found);
        } else if (std::next(found) != arguments.end()) {
            result.push_back(unmarked(*std::next(found)));
            arguments.erase(found, found + 2);
        } else {
            throw WrongUse(Message(missing));
        }
    }
    return result;
}

ColorUse colorUseOf(std::string const& word) {
    if (word == "always") {
        return ColorUse::Always;
    }
    if (word == "never") {
        return ColorUse::Never;
    }
    if (word != "auto") {
        throw WrongUse(Message("ColorUnknown", word));
    }
    return ColorUse::Auto;
}

} // namespace

void declareCommonOptions(CLI::App& tool) {
    auto const ignore = [] {};
    auto const ignoreValue = [](CLI::results_t const&) { return true; };
    tool.add_flag_callback("--version", ignore);
    completes(tool.add_option(inFolder, ignoreValue), Completes::Folders);
    tool.add_flag_callback(fullNames, ignore);
    tool.add_flag_callback(sourceControlOff, ignore);
    completes(tool.add_option(color, ignoreValue), Completes::ColorUses);
    tool.add_flag_callback(pagerOff, ignore);
    tool.add_flag_callback(quiet, ignore);
}

std::vector<std::string> takeCommonOptions(std::vector<std::string>& arguments) {
    settings().sourceControl = std::erase(arguments, sourceControlOff) == 0;
    settings().showsFullNames = std::erase(arguments, fullNames) > 0;
    settings().usesPager = std::erase(arguments, pagerOff) == 0;
    if (std::erase(arguments, quiet) > 0) {
        output().beQuiet();
    }
    auto use = ColorUse::Auto;
    for (auto const& word : takeValues(arguments, color, "ColorMissing")) {
        use = colorUseOf(word);
    }
    useColors(use);
    return takeValues(arguments, inFolder, "FolderMissing");
}

std::vector<std::string> const& commonOptions() {
    static std::vector<std::string> const names{inFolder, fullNames, sourceControlOff,
                                                color,    pagerOff,  quiet};
    return names;
}

bool isCommonOption(std::string const& argument) {
    return std::ranges::find(commonOptions(), argument) != commonOptions().end() ||
           hasValueInside(argument, color);
}

bool isBeforeItsValue(std::string const& option) {
    return option == inFolder || option == color;
}

} // namespace projectctl

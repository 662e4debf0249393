#include "cli/CommonOptions.hpp"

#include <algorithm>
#include <iterator>

#include "cli/CodedFailure.hpp"
#include "cli/Completes.hpp"
#include "cli/Settings.hpp"
#include "cli/TextArguments.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

constexpr char const* sourceControlOff = "--no-source-control";
constexpr char const* fullNames = "--full-name";
constexpr char const* pagerOff = "--no-pager";
constexpr char const* quiet = "--quiet";
constexpr char const* inFolder = "-C";

} // namespace

void declareCommonOptions(CLI::App& tool) {
    auto const ignore = [] {};
    tool.add_flag_callback("--version", ignore);
    completes(tool.add_option(inFolder, [](CLI::results_t const&) { return true; }), Completes::Folders);
    tool.add_flag_callback(fullNames, ignore);
    tool.add_flag_callback(sourceControlOff, ignore);
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
    std::vector<std::string> folders;
    for (auto found = std::ranges::find(arguments, inFolder); found != arguments.end();
         found = std::ranges::find(arguments, inFolder)) {
        if (std::next(found) == arguments.end()) {
            throw WrongUse(Message("FolderMissing"));
        }
        folders.push_back(unmarked(*std::next(found)));
        arguments.erase(found, found + 2);
    }
    return folders;
}

std::vector<std::string> const& commonOptions() {
    static std::vector<std::string> const names{inFolder, fullNames, sourceControlOff, pagerOff, quiet};
    return names;
}

bool isCommonOption(std::string const& argument) {
    return std::ranges::find(commonOptions(), argument) != commonOptions().end();
}

bool hasFolder(std::string const& option) {
    return option == inFolder;
}

} // namespace projectctl

#include "git/GitCommand.hpp"

#include <utility>

#include "output/NameForms.hpp"

namespace projectctl {

ProcessResult runGit(fl::filesystem::Path const& folder, std::vector<std::string> const& arguments,
                     std::string_view input, std::vector<std::string> const& environment) {
    std::string name;
    appendBytes(name, folder.native());
    std::vector<std::string> command;
    if (!environment.empty()) {
        command.emplace_back("env");
        command.insert(command.end(), environment.begin(), environment.end());
    }
    command.insert(command.end(), {"git", "-C", std::move(name)});
    command.insert(command.end(), arguments.begin(), arguments.end());
    return runWithInput(command, input);
}

} // namespace projectctl

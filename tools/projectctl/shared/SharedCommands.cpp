#include "shared/SharedCommands.hpp"

#include <array>
#include <ctime>
#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "shared/Commands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeSharedCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeSharedStatusCommand());
    members.push_back(makeSharedTidyCommand());
    members.push_back(makeSharedLogCommand());
    members.push_back(makeSharedRolesCommand());
    return std::make_unique<CommandGroup>("shared", std::move(members));
}

project::stores::JournalBackend& requireLog(OpenProject& project) {
    if (project.log() == nullptr) {
        throw Failure(Message("NotShared"));
    }
    return *project.log();
}

namespace {

std::string formatted(std::chrono::system_clock::time_point time, char const* form) {
    auto const seconds = std::chrono::system_clock::to_time_t(time);
    std::tm parts{};
    gmtime_r(&seconds, &parts);
    std::array<char, 32> text{};
    std::strftime(text.data(), text.size(), form, &parts);
    return text.data();
}

} // namespace

std::string shownTime(std::chrono::system_clock::time_point time) {
    return formatted(time, "%F %T UTC");
}

std::u16string timeInJson(std::chrono::system_clock::time_point time) {
    return textOf(formatted(time, "%FT%TZ"));
}

} // namespace projectctl

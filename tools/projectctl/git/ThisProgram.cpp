#include "git/ThisProgram.hpp"

#include <filesystem>
#include <system_error>

#include <unistd.h>

#include "git/GitCommand.hpp"
#include "output/Failure.hpp"

namespace projectctl {

using fl::filesystem::Path;

std::string thisProgram() {
    std::error_code error;
    std::string program = std::filesystem::read_symlink("/proc/self/exe", error).string();
    if (error || !canBeRun(program)) {
        throw Failure(Message("ProgramUnknown"));
    }
    return program;
}

bool canBeRun(std::string const& program) {
    std::error_code error;
    return std::filesystem::is_regular_file(program, error) && access(program.c_str(), X_OK) == 0;
}

void configureGit(Path const& folder, char const* key, std::string const& value) {
    auto const result = runGit(folder, {"config", "--replace-all", key, value});
    if (result.exitCode != 0) {
        throw Failure(Message("GitNotSetUp", result.errors.substr(0, result.errors.find('\n'))));
    }
}

} // namespace projectctl

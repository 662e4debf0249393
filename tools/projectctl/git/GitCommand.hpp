#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "git/PipedProcess.hpp"

namespace projectctl {

/// Runs git in a folder and waits for its end.
/// @param environment further variables, as "NAME=value".
/// @throws std::system_error when git cannot be started; no_such_file_or_directory when it is not installed.
ProcessResult runGit(fl::filesystem::Path const& folder, std::vector<std::string> const& arguments,
                     std::string_view input = {}, std::vector<std::string> const& environment = {});

} // namespace projectctl

#include "cli/StandardInput.hpp"

#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <system_error>
#include <utility>

#include "cli/CodedFailure.hpp"
#include "output/Failure.hpp"

namespace projectctl {

void claimStandardInput() {
    static bool isClaimed = false;
    if (std::exchange(isClaimed, true)) {
        throw WrongUse(Message("InputClaimed"));
    }
}

std::string readFileOrInput(std::optional<std::string> const& file) {
    if (!file || *file == "-") {
        claimStandardInput();
        std::cin.sync_with_stdio(false);
        return {std::istreambuf_iterator<char>(std::cin), {}};
    }
    std::error_code error;
    std::ifstream stream(*file, std::ios::binary);
    if (!stream || std::filesystem::is_directory(*file, error)) {
        throw Failure(Message("FileUnreadable", *file));
    }
    return {std::istreambuf_iterator<char>(stream), {}};
}

} // namespace projectctl

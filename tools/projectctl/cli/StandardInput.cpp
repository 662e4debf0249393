#include "cli/StandardInput.hpp"

#include <utility>

#include "cli/CodedFailure.hpp"

namespace projectctl {

void claimStandardInput() {
    static bool isClaimed = false;
    if (std::exchange(isClaimed, true)) {
        throw WrongUse("standard input contains the batch, or paths for an earlier command");
    }
}

} // namespace projectctl

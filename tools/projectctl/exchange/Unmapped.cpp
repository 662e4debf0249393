#include "exchange/Unmapped.hpp"

#include <algorithm>

#include "cli/ExitCode.hpp"
#include "output/Output.hpp"

namespace projectctl {

void Unmapped::add(std::size_t line, std::string reason) {
    items_.push_back({line, std::move(reason)});
}

int Unmapped::report() {
    std::ranges::stable_sort(items_, {}, &Item::line);
    for (auto const& [line, reason] : items_) {
        printError(source_ + ':' + (line > 0 ? std::to_string(line) + ": " : " ") + reason);
    }
    return isEmpty() ? exit_code::done : exit_code::finding;
}

} // namespace projectctl

#include "exchange/Unmapped.hpp"

#include <algorithm>

#include "cli/ExitCode.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

void Unmapped::add(std::size_t line, Message const& reason) {
    items_.push_back({line, reason.text()});
}

void Unmapped::add(std::size_t line, Failure const& reason) {
    items_.push_back({line, reason.what()});
}

int Unmapped::report() {
    sort();
    for (auto const& [line, reason] : items_) {
        printError(line > 0 ? Message("UnmappedAt", source_, std::to_string(line), reason)
                            : Message("Unmapped", source_, reason));
    }
    return exitCode();
}

int Unmapped::addTo(JsonObject& object) {
    sort();
    object.addKey("unmapped");
    JsonRows rows;
    for (auto const& [line, reason] : items_) {
        rows.begin();
        if (line > 0) {
            rows.addNumber("line", line);
        }
        rows.addText("text", textOf(reason));
    }
    rows.finish();
    return exitCode();
}

void Unmapped::sort() {
    std::ranges::stable_sort(items_, {}, &Item::line);
}

int Unmapped::exitCode() const noexcept {
    return isEmpty() ? exit_code::done : exit_code::finding;
}

} // namespace projectctl

#include "journal/BodySearch.hpp"

#include <algorithm>

namespace project::stores {

std::optional<JournalPosition> newestBody(Journal& journal, std::optional<std::uint64_t> before) {
    constexpr std::size_t recordsPerPage = 1'000;
    for (;;) {
        auto const records = journal.records(before, recordsPerPage);
        auto const found = std::find_if(records.begin(), records.end(),
                                        [](JournalRecord const& record) { return record.isBody; });
        if (found != records.end()) {
            return found->position;
        }
        if (records.empty()) {
            return std::nullopt;
        }
        before = records.back().position.version;
    }
}

} // namespace project::stores

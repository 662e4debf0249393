#include "history/CommitChanges.hpp"

#include <algorithm>
#include <set>
#include <utility>

#include "git/Blobs.hpp"
#include "history/TextLog.hpp"

namespace projectctl {

namespace {

std::size_t endOfCommit(std::vector<LoggedCommit> const& entries, std::size_t begin) {
    auto end = begin;
    while (end < entries.size() && entries[end].id == entries[begin].id) {
        ++end;
    }
    return end;
}

} // namespace

void CommitChanges::forEach(Receiver const& receive) {
    visitTextLog(project_, {}, [&](TextLog const& part) { return passOn(part.commits, part.text, receive); });
}

bool CommitChanges::passOn(Entries const& entries, std::string const& text, Receiver const& receive) {
    constexpr std::size_t fewest = 8;
    constexpr std::size_t most = 512;
    constexpr std::size_t largest = std::size_t{32} * 1024 * 1024; // bytes of all texts
    std::size_t count = fewest;                                    // of entries whose texts are read together
    std::size_t read = 0;                                          // entries whose texts were read
    for (std::size_t begin = 0; begin < entries.size();) {
        auto const end = endOfCommit(entries, begin);
        if (end > read) {
            read = std::min(std::max(begin + count, end), entries.size());
            readTexts(entries, begin, read, text);
            std::size_t bytes = 0;
            for (auto const& [id, content] : texts_) {
                bytes += content.size();
            }
            count = bytes > largest ? std::max(count / 2, std::size_t{1}) : std::min(count * 2, most);
        }
        if (!passOnCommit(entries, begin, end, text, receive)) {
            return false;
        }
        begin = end;
    }
    return true;
}

bool CommitChanges::passOnCommit(Entries const& entries, std::size_t begin, std::size_t end,
                                 std::string const& text, Receiver const& receive) {
    auto changes = changesOf(entries[begin], text);
    for (auto entry = begin + 1; entry < end; ++entry) {
        auto const others = changesOf(entries[entry], text);
        std::erase_if(changes, [&](auto const& change) { return std::ranges::count(others, change) == 0; });
    }
    bool const isMerge = entries[begin].parents.size() > 1;
    return (isMerge && changes.empty()) || receive(entries[begin], changes);
}

/// Keeps the texts that the previous entries have in common with these.
void CommitChanges::readTexts(Entries const& entries, std::size_t begin, std::size_t end,
                              std::string const& text) {
    std::map<std::string, std::string> kept;
    std::set<std::string> missing;
    for (auto entry = begin; entry < end; ++entry) {
        if (auto const* const change = changeOfText(entries[entry], text)) {
            for (auto const& id : {change->before, change->after}) {
                auto known = texts_.extract(id);
                if (known) {
                    kept.insert(std::move(known));
                } else if (!kept.contains(id)) {
                    missing.insert(id);
                }
            }
        }
    }
    kept.merge(readBlobs(project_.root(), missing));
    texts_ = std::move(kept);
}

CommitChanges::Changes CommitChanges::changesOf(LoggedCommit const& entry, std::string const& text) const {
    auto const* const change = changeOfText(entry, text);
    return change == nullptr
               ? Changes()
               : project::stores::changesBetween(texts_.at(change->before), texts_.at(change->after),
                                                 project_.renamesIn(entry.changes));
}

} // namespace projectctl

#include "support/JournalStore.hpp"

#include <utility>

namespace project::test {

std::unique_ptr<JournalBackend> JournalStore::open(Options options, std::shared_ptr<SavedText> cache) const {
    return std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server), options,
                                            cache ? std::make_unique<MemoryCache>(std::move(cache))
                                                  : nullptr);
}

void JournalStore::prepare(std::vector<std::u16string> const& files) const {
    commit(*open(), addFiles(files));
    server->calls.clear();
}

Content files(std::vector<std::u16string> const& paths) {
    return contentAfter({addFiles(paths)});
}

} // namespace project::test

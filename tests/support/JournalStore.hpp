#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <gmock/gmock.h>

#include "project/stores/JournalBackend.hpp"
#include "support/MemoryJournal.hpp"
#include "support/TextStore.hpp"

namespace project::test {

using stores::JournalBackend;

/// A cache in memory that outlives the process that uses it.
struct SavedText {
    std::optional<stores::CachedText> cached;
    std::size_t times = 0; ///< that a text was stored
    bool isFrozen = false; ///< the process has died, and stores nothing any more
};

class MemoryCache : public stores::JournalCache {
public:
    explicit MemoryCache(std::shared_ptr<SavedText> saved) : saved_(std::move(saved)) {}

    std::optional<stores::CachedText> load() noexcept override { return saved_->cached; }

    void store(stores::CachedText const& cached) noexcept override {
        if (!saved_->isFrozen) {
            saved_->cached = cached;
            ++saved_->times;
        }
    }

private:
    std::shared_ptr<SavedText> saved_;
};

/// Clients of a shared project on a server in memory.
class JournalStore : public ::testing::Test {
protected:
    using Options = JournalBackend::Options;
    using Fault = JournalServer::InjectedFault;

    /// Batches are appended, as in a project of usual size.
    static Options appending() { return {.patience = std::chrono::milliseconds(10)}; }

    /// Every batch is committed with a body.
    static Options ofBodies() {
        return {.patience = std::chrono::milliseconds(10), .shortTail = 0, .bodyToTail = 1'000'000};
    }

    std::unique_ptr<JournalBackend> open(Options options = appending(),
                                         std::shared_ptr<SavedText> cache = nullptr) const;

    /// Commits a first batch with these files.
    void prepare(std::vector<std::u16string> const& files) const;

    /// The content that another client reads now.
    Content stored() const { return contentOf(*open()); }

    /// The calls of the server since the last time.
    std::vector<std::string> calls() const { return std::exchange(server->calls, {}); }

    std::shared_ptr<JournalServer> const server = std::make_shared<JournalServer>();
};

/// The content of a store with these files.
Content files(std::vector<std::u16string> const& paths);

} // namespace project::test

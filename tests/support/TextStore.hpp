#pragma once

#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "project/stores/StoreError.hpp"
#include "project/stores/TextBackend.hpp"
#include "support/CrashingDisk.hpp"
#include "support/ProjectTextSamples.hpp"

namespace project::metadata {

/// Prints an address in the message of a failed test.
void PrintTo(MetadataPath const& address, std::ostream* out);

} // namespace project::metadata

namespace project::test {

using fl::filesystem::Path;
using stores::Access;
using stores::Address;
using stores::Backend;
using stores::Batch;
using stores::FileChanges;
using stores::StoreError;
using stores::TextBackend;
using stores::samples::addressesOf;
using stores::samples::addressOf;
using stores::samples::Content;
using stores::samples::fileAddress;
using stores::samples::make;
using stores::samples::makeNode;
using stores::samples::remove;
using stores::samples::set;

/// An outermost guard of the tree, held by a scope.
class Entered {
public:
    explicit Entered(Backend& backend, Access access = Access::Read)
        : backend_(backend), changes_(backend.enter(access)) {}

    ~Entered() { backend_.leave(); }

    Entered(Entered const&) = delete;
    Entered& operator=(Entered const&) = delete;

    /// The changes of other processes that the guard found.
    stores::Changes const& changes() const { return changes_; }

private:
    Backend& backend_;
    stores::Changes changes_;
};

/// Writes and commits a batch, like the tree.
FileChanges commit(Backend& backend, Batch const& batch);

/// A batch that adds the files of these paths.
Batch addFiles(std::vector<std::u16string> const& paths);

/// Paths of files "<folder>/0000", "<folder>/0001" and so on.
std::vector<std::u16string> manyFiles(std::size_t count, std::u16string const& folder = u"many");

/// The whole content of a backend, under one read guard.
Content contentOf(Backend& backend);

/// The same under the guard that is already open.
Content loadAll(Backend& backend);

/// The content of a store after these batches.
Content contentAfter(std::vector<Batch> const& batches);

/// A text of these batches, the first one in the body and the others in the tail.
std::string textOf(Batch const& body, std::vector<Batch> const& tail = {});

/// The error of a call; the test fails if there is none.
template <typename Call>
StoreError errorOf(Call const& call) {
    try {
        call();
    } catch (StoreError const& error) {
        return error;
    }
    ADD_FAILURE() << "no StoreError was thrown";
    return StoreError(StoreError::Kind::DiskFailed, "", 0, "none", "");
}

/// A text store on a file system in memory.
class TextStore : public ::testing::Test {
protected:
    using Options = TextBackend::Options;

    /// Every batch rewrites the text.
    static Options rewriting() {
        return {.patience = std::chrono::milliseconds(100), .alwaysRewritten = 1'000'000, .bodyToTail = 16};
    }

    /// Batches are appended to bodies of any length, until they are as long as the body.
    static Options appending() {
        return {.patience = std::chrono::milliseconds(100), .alwaysRewritten = 0, .bodyToTail = 1};
    }

    std::unique_ptr<TextBackend> open(Options options = rewriting()) const {
        return std::make_unique<TextBackend>(std::make_unique<CrashingDisk>(volume), options);
    }

    /// Creates a store with exactly these files, closed and durable.
    void prepare(std::vector<std::u16string> const& files) const;

    /// Creates a store with this text, like a checkout.
    void prepareText(std::string text) const;

    /// Injects a fault into the first call of this name.
    void failOnce(std::string call) const;

    /// The content that another process reads now.
    Content stored(Options options = rewriting()) const { return contentOf(*open(options)); }

    /// The calls since the last time that change the disk.
    std::vector<std::string> writes() const;

    std::string text() const { return volume->content("project.jsonl"); }

    std::shared_ptr<CrashingVolume> const volume = std::make_shared<CrashingVolume>();
};

} // namespace project::test

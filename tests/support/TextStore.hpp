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

/// How a failed test shows an address.
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

/// A guard of the tree: enters, and leaves when it goes.
class Entered {
public:
    explicit Entered(Backend& backend, Access access = Access::Read)
        : backend_(backend), changes_(backend.enter(access)) {}

    ~Entered() { backend_.leave(); }

    Entered(Entered const&) = delete;
    Entered& operator=(Entered const&) = delete;

    /// What others had changed.
    stores::Changes const& changes() const { return changes_; }

private:
    Backend& backend_;
    stores::Changes changes_;
};

/// Writes a batch and keeps it, as the tree does.
FileChanges commit(Backend& backend, Batch const& batch);

/// A batch that adds the files of these paths.
Batch addFiles(std::vector<std::u16string> const& paths);

/// Paths of files "<folder>/0000", "<folder>/0001" and so on.
std::vector<std::u16string> manyFiles(std::size_t count, std::u16string const& folder = u"many");

/// All that a backend has, under one read guard.
Content contentOf(Backend& backend);

/// The same as loaded under the guard that is open.
Content loadAll(Backend& backend);

/// What a store holds after these batches.
Content contentAfter(std::vector<Batch> const& batches);

/// A text of these batches, the first one in the body and the others behind it.
std::string textOf(Batch const& body, std::vector<Batch> const& tail = {});

/// The error that a call throws; the test fails when it throws none.
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

    /// Every batch writes the text anew.
    static Options rewriting() { return {std::chrono::milliseconds(100), 1'000'000, 16}; }

    /// Batches are appended to bodies of any length, until they are as long as the body.
    static Options appending() { return {std::chrono::milliseconds(100), 0, 1}; }

    std::unique_ptr<TextBackend> open(Options options = rewriting()) const {
        return std::make_unique<TextBackend>(std::make_unique<CrashingDisk>(volume), options);
    }

    /// Makes a store with just these files, closed and settled.
    void prepare(std::vector<std::u16string> const& files) const;

    /// Makes a store with this text, as git brings it.
    void prepareText(std::string text) const;

    /// Lets the first call of this name fail.
    void failOnce(std::string call) const;

    /// What another process reads in the project now.
    Content stored(Options options = rewriting()) const { return contentOf(*open(options)); }

    /// The calls since the last time that change something on disk.
    std::vector<std::string> writes() const;

    std::string text() const { return volume->content("project.jsonl"); }

    std::shared_ptr<CrashingVolume> const volume = std::make_shared<CrashingVolume>();
};

} // namespace project::test

#include <filesystem>
#include <fstream>
#include <set>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "RecordedCalls.hpp"
#include "project/stores/SystemDisk.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

namespace project::test {
namespace {

namespace fs = std::filesystem;

using stores::samples::bodyOf;

std::string const linesThatLeadOutside = R"("../../outside.jsonl"
"../.."
"./../outside.jsonl"
"a/../../../outside.jsonl"
"\\..\\outside.jsonl"
"\u0000"
"a\u0000b"
"~/outside.jsonl"
{"at":["Files","Root","DIR_SIGNIFIER","1","File",".."],"node":false}
{"at":["Files","Root","File","../../outside.jsonl"]}
{"at":["Files","Root","File",""]}
{"at":["Files","Root","File","/etc/passwd"]}
{"at":["","..","..",""],"keys":{"..":"../.."}}
)";

/// A project from an untrusted clone, with a text and a folder that try to lead outside.
class NeverOutside : public ::testing::Test {
protected:
    NeverOutside() {
        fs::create_directories(store());
        std::ofstream(outside()) << bodyOf({"\"secret\""});
        write(linesThatLeadOutside + '"' + std::string(5000, 'n') + "\"\n");
        for (auto const* name : {"project.jsonl.x.tmp", "displaced-x", "damaged-x.jsonl", ".gitignore"}) {
            fs::create_symlink(outside(), store() / name);
        }
    }

    ~NeverOutside() override {
        std::ifstream file(outside());
        EXPECT_EQ(std::string(std::istreambuf_iterator<char>(file), {}), bodyOf({"\"secret\""}));
        EXPECT_EQ(std::distance(fs::directory_iterator(folder_.onDisk()), fs::directory_iterator()), 2);
    }

    fs::path root() const { return folder_.onDisk() / "project"; }

    fs::path store() const { return root() / ".projectdata"; }

    fs::path outside() const { return folder_.onDisk() / "outside.jsonl"; }

    void write(std::string const& lines) const {
        std::ofstream(store() / "project.jsonl", std::ios::binary | std::ios::trunc)
            << bodyOf({lines.substr(0, lines.size() - 1)});
    }

    std::unique_ptr<TextBackend> open() const {
        TextBackend::Options const options{
            .patience = std::chrono::milliseconds(20), .alwaysRewritten = 0, .bodyToTail = 1};
        return std::make_unique<TextBackend>(
            stores::makeSystemDisk(fl::filesystem::fromSystem(root()), stores::TextBackend::folderName),
            options);
    }

    /// The calls for places outside the store. Allowed are opening the root, to find the folder in it, and
    /// asking the kernel for a lock holder.
    std::set<std::string> strays(RecordedCalls const& recorded) const {
        std::set<std::string> found;
        std::string const inside = store().string() + "/";
        for (auto const& [name, path] : recorded.calls()) {
            bool const isOwn = path == root().string() || path == store().string() || path == "/proc/locks";
            bool const isPlainName = path.starts_with(inside) && path.find('/', inside.size()) == path.npos &&
                                     !path.ends_with("/..");
            if (!isOwn && !isPlainName) {
                found.insert(name + " " + path);
            }
        }
        return found;
    }

    /// Runs a call and checks that it called the system, and only for places in the store.
    template <typename Call>
    void expectInside(Call const& call) const {
        RecordedCalls const recorded;
        call();
        EXPECT_GT(recorded.calls().size(), 3U);
        EXPECT_EQ(strays(recorded), std::set<std::string>());
    }

    TemporaryFolder folder_;
};

TEST_F(NeverOutside, whenAHostileProjectIsReadAndChecked) {
    expectInside([this] {
        EXPECT_GT(contentOf(*open()).size(), 10U);
        open()->check();
    });
}

TEST_F(NeverOutside, whenAHostileProjectIsWritten) {
    expectInside([this] {
        auto const store = open();
        commit(*store, addFiles({u"a"})); // rewritten
        commit(*store, addFiles({u"b"})); // appended
        commit(*store, {remove(fileAddress(u".."))});
        store->tidy();
    });
    EXPECT_FALSE(contentOf(*open()).contains(fileAddress(u"../..")));
}

TEST_F(NeverOutside, whenADamagedTextIsRepaired) {
    write(linesThatLeadOutside + "\"/outside.jsonl\"\n{\"file\":\"../../../damage\n");
    expectInside([this] { EXPECT_FALSE(open()->repair().empty()); });
}

TEST_F(NeverOutside, whenAConflictIsResolved) {
    write("<<<<<<< ../../ours\n" + linesThatLeadOutside + "=======\n\"../b\"\n>>>>>>> /theirs\n");
    expectInside([this] { open()->resolve(bodyOf({"\"../a\""})); });
}

TEST_F(NeverOutside, whenAStoreIsCreatedAndRolledBack) {
    fs::remove(store() / "project.jsonl");
    expectInside([this] {
        auto const store = open();
        Entered const guard(*store, Access::Write);
        store->write(addFiles({u"../../a"}));
        store->discard();
    });
}

TEST_F(NeverOutside, aCallForAnotherPlaceIsDetected) {
    RecordedCalls const recorded;
    RecordedCalls::note("openat", -1, outside().c_str());
    RecordedCalls::note("openat", -1, (store() / "..").c_str());
    RecordedCalls::note("openat", -1, (store() / "a/b").c_str());
    EXPECT_EQ(strays(recorded).size(), 3U);
}

} // namespace
} // namespace project::test

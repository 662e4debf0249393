#include <atomic>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <sys/un.h>
#include <unistd.h>

#include "project/stores/SystemDisk.hpp"
#include "support/Allocations.hpp"
#include "support/NightlyScale.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

namespace project::test {
namespace {

namespace fs = std::filesystem;

using stores::Fault;
using stores::samples::bodyOf;
using ::testing::HasSubstr;

/// Creates something other than a regular file of the project at a path. @return false if the system
/// refuses.
struct Thing {
    char const* name;
    bool (*put)(fs::path const& place, fs::path const& outside);

    friend void PrintTo(Thing const& thing, std::ostream* out) { *out << thing.name; }
};

bool putSocket(fs::path const& place) {
    int const made = ::socket(AF_UNIX, SOCK_STREAM, 0);
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    place.string().copy(address.sun_path, sizeof(address.sun_path) - 1);
    bool const bound =
        ::bind(made, reinterpret_cast<sockaddr const*>(&address), sizeof(address)) == 0; // NOLINT
    ::close(made);
    return bound;
}

bool putLink(fs::path const& place, fs::path const& target) {
    std::error_code error;
    fs::create_symlink(target, place, error);
    return !error;
}

std::vector<Thing> const things = {
    {"aPipe", [](auto const& place, auto const&) { return ::mkfifo(place.c_str(), 0666) == 0; }},
    {"aSocket", [](auto const& place, auto const&) { return putSocket(place); }},
    {"aDevice",
     [](auto const& place, auto const&) {
         constexpr unsigned memoryDevices = 1;
         constexpr unsigned zeroes = 5;
         return ::mknod(place.c_str(), S_IFCHR | 0666, makedev(memoryDevices, zeroes)) == 0 ||
                ::mknod(place.c_str(), S_IFCHR | 0666, makedev(0, 0)) ==
                    0; // the one that every user can create
     }},
    {"aFolder", [](auto const& place, auto const&) { return fs::create_directory(place); }},
    {"aLinkToAFileOutside", [](auto const& place, auto const& outside) { return putLink(place, outside); }},
    {"aLinkToADevice", [](auto const& place, auto const&) { return putLink(place, "/dev/zero"); }},
    {"aLinkToItself", [](auto const& place, auto const&) { return putLink(place, place.filename()); }},
    {"aLinkToNothing", [](auto const& place, auto const&) { return putLink(place, "../../not-there"); }},
};

std::vector<Thing> thingsButAFolder() {
    auto result = things;
    std::erase_if(result, [](Thing const& thing) { return thing.name == std::string_view("aFolder"); });
    return result;
}

/// A project from an untrusted clone, and a file outside that the store must not touch.
class HostileFolder : public ::testing::Test {
protected:
    HostileFolder() {
        fs::create_directory(root());
        std::ofstream(outside()) << outsideText();
    }

    ~HostileFolder() override { EXPECT_EQ(contentAt(outside()), outsideText()); }

    fs::path root() const { return folder_.onDisk() / "project"; }

    fs::path inStore(std::string const& name) const { return root() / ".projectdata" / name; }

    fs::path outside() const { return folder_.onDisk() / "outside.jsonl"; }

    /// So long that a batch is appended to a text with it.
    static std::u16string longName() { return std::u16string(500, u'0'); }

    static std::string longText(std::string const& file) {
        return bodyOf({'"' + std::string(500, '0') + '"', '"' + file + '"'});
    }

    static std::string outsideText() { return longText("secret"); }

    static std::string contentAt(fs::path const& path) {
        std::ifstream file(path, std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    void prepareText(std::string const& text) const {
        fs::create_directory(root() / ".projectdata");
        std::ofstream(inStore("project.jsonl"), std::ios::binary) << text;
    }

    /// With little patience, and appending whenever possible.
    static std::unique_ptr<TextBackend> open(fs::path const& where) {
        TextBackend::Options const options{
            .patience = std::chrono::milliseconds(20), .alwaysRewritten = 0, .bodyToTail = 1};
        return std::make_unique<TextBackend>(
            stores::makeSystemDisk(fl::filesystem::fromSystem(where), stores::TextBackend::folderName),
            options);
    }

    std::unique_ptr<TextBackend> open() const { return open(root()); }

    /// Every operation on a store is an error, and none waits.
    void expectRefused() const {
        auto const store = open();
        for (std::function<void()> const& call : std::vector<std::function<void()>>{
                 [&] { contentOf(*store); }, [&] { commit(*store, addFiles({u"b"})); },
                 [&] { store->tidy(); }, [&] { store->repair(); }, [&] { store->check(); },
                 [&] { store->resolve(bodyOf({"\"a\""})); }}) {
            EXPECT_THAT(errorOf(call).file(), HasSubstr(".projectdata"));
        }
    }

    TemporaryFolder folder_;
};

class HostileThing : public HostileFolder, public ::testing::WithParamInterface<Thing> {
protected:
    bool put(fs::path const& place) const { return GetParam().put(place, outside()); }
};

using HostileNoFolder = HostileThing;

TEST_P(HostileThing, inThePlaceOfTheTextIsAnErrorAtOnce) {
    fs::create_directory(root() / ".projectdata");
    ASSERT_TRUE(put(inStore("project.jsonl")));
    expectRefused();
}

TEST_P(HostileNoFolder, inThePlaceOfTheFolderIsAnErrorAtOnce) {
    ASSERT_TRUE(put(root() / ".projectdata"));
    expectRefused();
}

TEST_P(HostileThing, inThePlaceOfTheFilesForSourceControlStaysAsItIs) {
    fs::create_directory(root() / ".projectdata");
    for (auto const* name : {".gitattributes", ".gitignore"}) {
        ASSERT_TRUE(put(inStore(name)));
    }

    auto const files = commit(*open(), addFiles({u"a"}));

    EXPECT_EQ(files.added.size(), 1U); // the text alone
    EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({u"a"})}));
    EXPECT_FALSE(fs::is_regular_file(fs::symlink_status(inStore(".gitattributes"))));
}

TEST_P(HostileThing, withTheNameOfATemporaryFileIsSetAside) {
    prepareText(bodyOf({"\"a\""}));
    for (auto const* name :
         {"project.jsonl.x.tmp", "project.jsonl.0123456789abcdef-0123456789abcdef.swap.tmp"}) {
        ASSERT_TRUE(put(inStore(name)));
    }

    commit(*open(), addFiles({u"b"}));

    EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({u"a", u"b"})}));
    EXPECT_FALSE(fs::exists(fs::symlink_status(inStore("project.jsonl.x.tmp"))));
    auto const faults = open()->check();
    EXPECT_EQ(std::ranges::count(faults, Fault::Kind::Displaced, &Fault::kind), 2);
}

std::string nameOf(::testing::TestParamInfo<Thing> const& thing) {
    return thing.param.name;
}

INSTANTIATE_TEST_SUITE_P(, HostileThing, ::testing::ValuesIn(things), nameOf);
INSTANTIATE_TEST_SUITE_P(, HostileNoFolder, ::testing::ValuesIn(thingsButAFolder()), nameOf);

TEST_F(HostileFolder, aTextOfAnImpossibleLengthIsAnErrorAtOnce) {
    constexpr off_t tebibyte = off_t{1} << 40;
    prepareText(bodyOf({"\"a\""}));
    ASSERT_EQ(0, ::truncate(inStore("project.jsonl").c_str(), tebibyte));
    Allocations const allocated;

    EXPECT_EQ(stores::StoreError::Kind::Damaged, errorOf([&] { contentOf(*open()); }).kind());

    EXPECT_LT(allocated.peak(), 1024U * 1024);
    expectRefused();
}

TEST_F(HostileFolder, readingATextThatGrowsEnds) {
    prepareText(bodyOf({"\"a\""}));
    std::atomic<bool> enough = false;
    std::thread writer([&] {
        std::ofstream file(inStore("project.jsonl"), std::ios::binary | std::ios::app);
        constexpr std::size_t most = 64U * 1024 * 1024;
        for (std::size_t written = 0; !enough && written < most; written += 1000) {
            file << std::string(999, 'x') << '\n' << std::flush;
        }
    });
    auto const end = std::chrono::steady_clock::now() + std::chrono::milliseconds(100);
    while (std::chrono::steady_clock::now() < end) {
        EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({u"a"})})); // the rest is a torn tail
    }
    enough = true;
    writer.join();
}

TEST_F(HostileFolder, aTextThatIsSharedWithACopyOfTheProjectIsNeverAppendedTo) {
    prepareText(longText("a"));
    auto const copy = folder_.addFolder("copy");
    fs::create_directory(copy / ".projectdata");
    fs::create_hard_link(inStore("project.jsonl"), copy / ".projectdata/project.jsonl");
    auto const before = contentAt(inStore("project.jsonl"));

    commit(*open(), addFiles({u"b"}));

    EXPECT_EQ(contentAt(copy / ".projectdata/project.jsonl"), before);
    EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({longName(), u"a", u"b"})}));
    commit(*open(copy), addFiles({u"c"}));
    EXPECT_EQ(contentOf(*open(copy)), contentAfter({addFiles({longName(), u"a", u"c"})}));
    EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({longName(), u"a", u"b"})}));
}

TEST_F(HostileFolder, aTextThatBecomesSharedWhileItIsOpenIsNotAppendedToEither) {
    prepareText(longText("a"));
    auto const store = open();
    contentOf(*store);
    fs::create_hard_link(inStore("project.jsonl"), folder_.onDisk() / "copy.jsonl");
    auto const before = contentAt(folder_.onDisk() / "copy.jsonl");

    commit(*store, addFiles({u"b"}));

    EXPECT_EQ(contentAt(folder_.onDisk() / "copy.jsonl"), before);
}

TEST_F(HostileFolder, aTextLinkedToAFileOutsideDoesNotChangeThatFile) {
    fs::create_directory(root() / ".projectdata");
    fs::create_hard_link(outside(), inStore("project.jsonl"));

    commit(*open(), addFiles({u"b"}));
    open()->tidy();

    EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({longName(), u"b", u"secret"})}));
}

TEST_F(HostileFolder, thousandsOfLeftoversAndStrangeNamesDoNoHarm) {
    prepareText(bodyOf({"\"a\""}));
    std::size_t const count = 100 * testSeconds(3);
    for (std::size_t i = 0; i < count; ++i) {
        std::ofstream(inStore("project.jsonl." + std::to_string(i) + ".tmp")) << "x";
        std::ofstream(inStore("\xFF strange\n" + std::to_string(i))) << "x";
    }

    commit(*open(), addFiles({u"b"}));

    EXPECT_EQ(contentOf(*open()), contentAfter({addFiles({u"a", u"b"})}));
    auto const left = static_cast<std::size_t>(
        std::distance(fs::directory_iterator(inStore("")), fs::directory_iterator()));
    EXPECT_EQ(left, count + 1); // the store does not delete the files with strange names
}

TEST_F(HostileFolder, filesNamedDisplacedAreReportedAndKept) {
    prepareText(bodyOf({"\"a\""}));
    fs::create_directory(inStore("displaced-folder"));
    putLink(inStore("displaced-link"), outside());

    commit(*open(), addFiles({u"b"}));

    auto const faults = open()->check();
    EXPECT_EQ(std::ranges::count(faults, Fault::Kind::Displaced, &Fault::kind), 2);
    EXPECT_TRUE(fs::is_directory(inStore("displaced-folder")));
}

} // namespace
} // namespace project::test

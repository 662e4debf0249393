#include <chrono>
#include <filesystem>
#include <iostream>
#include <list>
#include <random>
#include <thread>

#include "KilledWriters.hpp"
#include "project/stores/SystemDisk.hpp"
#include "support/NightlyScale.hpp"
#include "support/TemporaryFolder.hpp"

using testing::IsSubsetOf;

namespace project::test {

namespace {

using std::chrono::steady_clock;

/// The counts of a run, so that a run without kills is detected.
struct Counts {
    std::size_t kills = 0;
    std::size_t amidABatch = 0;     ///< of them
    std::size_t keptAllTheSame = 0; ///< of those, the batch was committed nevertheless
    std::size_t batches = 0;
    std::size_t projects = 0;
};

/// Kills writers of one project at random, and knows the expected content.
class Killer {
public:
    Killer(Counts& counts, std::mt19937_64& random) : counts_(counts), random_(random) {}

    void run(std::size_t kills) {
        ++counts_.projects;
        for (std::size_t writer = upTo(2) + 1; writer > 0; --writer) {
            start();
        }
        for (; kills > 0 && !testing::Test::HasFailure(); --kills) {
            wait();
            killOne();
            check();
            if (upTo(2) == 0) {
                writeOne(); // like another process, at the same time
                check();
            }
            start();
        }
        finish();
    }

private:
    std::size_t upTo(std::size_t bound) {
        return std::uniform_int_distribution<std::size_t>(0, bound)(random_);
    }

    /// Mostly short, so that many die while they create or open the store, and some run for a while.
    void wait() {
        constexpr std::size_t longest[] = {1'000, 5'000, 30'000};
        std::this_thread::sleep_for(std::chrono::microseconds(upTo(longest[upTo(2)])));
    }

    void start() { alive_.emplace_back(root_.path(), ++started_, random_()); }

    void killOne() {
        auto const victim = std::next(alive_.begin(), static_cast<std::ptrdiff_t>(upTo(alive_.size() - 1)));
        victim->kill();
        EXPECT_EQ("", victim->complaint());
        ++counts_.kills;
        counts_.amidABatch += victim->isAmidABatch() ? 1 : 0;
        dead_.splice(dead_.end(), alive_, victim);
    }

    std::unique_ptr<TextBackend> open() const {
        return std::make_unique<TextBackend>(
            stores::makeSystemDisk(root_.path(), stores::TextBackend::folderName));
    }

    /// Every batch that was reported as committed exists, for each writer at most the one that it had just
    /// begun in addition, and nothing else.
    void check();
    void writeOne();
    void finish();
    void checkWriter(KilledWriter& writer, std::size_t surely, Content const& found, Content& expected);

    Counts& counts_;
    std::mt19937_64& random_;
    TemporaryFolder root_;
    std::list<KilledWriter> alive_;
    std::list<KilledWriter> dead_;
    std::size_t started_ = 0;
    Content own_;
};

void Killer::check() {
    std::vector<std::size_t> surely;
    for (auto& writer : alive_) {
        writer.listen();
        surely.push_back(writer.kept());
    }
    auto const found = contentOf(*open());
    auto expected = own_;
    auto kept = surely.begin();
    for (auto& writer : alive_) {
        writer.listen();
        checkWriter(writer, *kept++, found, expected);
    }
    for (auto& writer : dead_) {
        checkWriter(writer, writer.kept(), found, expected);
        counts_.keptAllTheSame += writer.isAmidABatch() && writer.notedIn(found) == writer.begun() ? 1 : 0;
        writer.acceptOutcome(writer.notedIn(found));
    }
    EXPECT_EQ(expected, found);
}

void Killer::checkWriter(KilledWriter& writer, std::size_t surely, Content const& found, Content& expected) {
    auto const noted = writer.notedIn(found);
    EXPECT_GE(noted, surely) << "a committed batch is missing";
    EXPECT_LE(noted, writer.begun()) << "a batch that was never begun is in the project";
    expected.merge(writer.contentWith(noted));
}

void Killer::writeOne() {
    auto const file = addFiles({u"own/" + std::u16string(1, static_cast<char16_t>(u'a' + upTo(25)))});
    try {
        commit(*open(), file);
        own_.merge(contentAfter({file}));
    } catch (StoreError const& error) {
        EXPECT_EQ(StoreError::Kind::Busy, error.kind())
            << error.what(); // another writer has just created the store
    }
}

/// When all writers are dead, the project is usable at once, and tidy after the next writer.
void Killer::finish() {
    while (!alive_.empty()) {
        killOne();
    }
    check();
    for (auto const& writer : dead_) {
        counts_.batches += writer.kept();
    }
    TextBackend next(stores::makeSystemDisk(root_.path(), stores::TextBackend::folderName),
                     {.patience = std::chrono::milliseconds(1'000), .alwaysRewritten = 0, .bodyToTail = 1});
    commit(next, addFiles({u"own/last"}));
    own_.merge(contentAfter({addFiles({u"own/last"})}));
    check();
    std::vector<std::string> names;
    for (auto const& entry : std::filesystem::directory_iterator(root_.onDisk() / ".projectdata")) {
        names.push_back(entry.path().filename().string());
    }
    EXPECT_THAT(names, IsSubsetOf({".gitattributes", ".gitignore", "project.jsonl"}));
}

/// On disk, where syncs take most of the time, and in memory, where they do not.
void useFolder(bool inMemory, std::string const& usual) {
    bool const isThere = inMemory && std::filesystem::is_directory("/dev/shm");
    ::setenv("TMPDIR", isThere ? "/dev/shm" : usual.c_str(), 1);
}

TEST(ProcessKills, aCommittedBatchSurvivesAKillAtAnyMoment) {
    auto const seed = testSeed();
    SCOPED_TRACE("to repeat it, as far as the machine does: PROJECT_TEST_SEED=" + std::to_string(seed));
    std::mt19937_64 random(seed);
    Counts counts;
    auto const usual = std::filesystem::temp_directory_path().string();
    auto const end = steady_clock::now() + std::chrono::seconds(testSeconds(2));
    for (bool inMemory = false; steady_clock::now() < end && !HasFailure(); inMemory = !inMemory) {
        useFolder(inMemory, usual);
        Killer(counts, random).run(10);
    }
    useFolder(false, usual);
    std::cout << counts.kills << " writers of " << counts.projects << " projects were killed, "
              << counts.amidABatch << " of them in the middle of a batch, which was in the project "
              << counts.keptAllTheSame << " times; " << counts.batches << " batches were committed\n";
    EXPECT_GT(counts.amidABatch, 0U);
    EXPECT_GT(counts.batches, 0U);
}

} // namespace

} // namespace project::test

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstring>
#include <fstream>
#include <iostream>
#include <random>
#include <thread>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/ChildProcess.hpp"
#include "support/GitFolder.hpp"
#include "support/NightlyScale.hpp"
#include "support/SharedMemory.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"
#include "support/Waiting.hpp"

namespace project::test {

namespace {

using namespace std::chrono_literals;
using metadata::MetadataNodeSpecification;
using stores::TreeMetadataManager;

constexpr std::size_t folders = 200;
constexpr std::size_t filesInFolder = 16;
constexpr std::size_t groups = 4;
constexpr std::size_t inGroup = folders / groups;

/// Three files at the beginning, in the middle and at the end of the text. Every batch of a writer sets all
/// of them to the same value.
std::vector<std::u16string> const marked{u"a", u"folder100/marked", u"z"};

std::u16string folderName(std::size_t number) {
    auto const digits = std::to_string(1000 + number).substr(1);
    return u"folder" + std::u16string(digits.begin(), digits.end());
}

/// A file of a group. The files of a group are all in a project or none is; they are spread over the whole
/// text.
Address inGroupOf(std::size_t group, std::size_t index) {
    return fileAddress(folderName(index * groups + group) + u"/of a group");
}

Batch groupOf(std::size_t group) {
    Batch batch;
    for (std::size_t index = 0; index < inGroup; ++index) {
        batch.push_back(set(inGroupOf(group, index)));
    }
    return batch;
}

Batch valueOfMarked(std::u16string const& value) {
    Batch batch;
    for (auto const& path : marked) {
        batch.push_back(set(fileAddress(path), makeNode(u"Info", {{u"V", value}})));
    }
    return batch;
}

/// The counts of all processes.
struct Tally {
    std::atomic<bool> stop;
    std::atomic<unsigned> checks;    ///< guards of readers
    std::atomic<unsigned> others;    ///< of them, those that differed from the one before
    std::atomic<unsigned> written;   ///< batches
    std::atomic<unsigned> refused;   ///< batches, with an error
    std::atomic<unsigned> gitDid;    ///< commands
    std::atomic<unsigned> gitFailed; ///< commands, because of changes of the writers or conflicts
    std::array<char, 400> wrong;     ///< the first violation that a process found
};

/// The state of a project that one guard shows.
struct Sight {
    std::array<std::size_t, groups> groupFiles; ///< how many exist
    std::array<std::u16string, 3> values;
    std::size_t others; ///< of a sample of files that are in every version

    friend bool operator==(Sight const&, Sight const&) = default;
};

Sight lookAt(TreeMetadataManager& store) {
    Sight sight{};
    for (std::size_t group = 0; group < groups; ++group) {
        for (std::size_t index = 0; index < inGroup; ++index) {
            sight.groupFiles[group] += store.hasNode(inGroupOf(group, index)) ? 1U : 0U;
        }
    }
    for (std::size_t index = 0; index < marked.size(); ++index) {
        auto const node = store.getNode(fileAddress(marked[index]));
        sight.values[index] = node ? node->get(u"V") : u"none";
    }
    for (std::size_t folder = 0; folder < folders; folder += 20) {
        sight.others += store.hasNode(fileAddress(folderName(folder) + u"/0003")) ? 1U : 0U;
    }
    return sight;
}

/// The part that no complete version contained; empty if there is none.
std::string wrongWith(Sight const& sight) {
    if (sight.others != folders / 20) {
        return "files are missing that are in every version: " + std::to_string(sight.others);
    }
    for (std::size_t group = 0; group < groups; ++group) {
        if (sight.groupFiles[group] != inGroup && (group == 0 || sight.groupFiles[group] != 0)) {
            return "half of group " + std::to_string(group) + ": " + std::to_string(sight.groupFiles[group]);
        }
    }
    if (sight.values[0] != sight.values[1] || sight.values[0] != sight.values[2] ||
        sight.values[0] == u"none") {
        return "half of a batch";
    }
    return {};
}

/// A repository with a project in several versions: main has group 0, and each other branch has one more
/// group, two of them in the tail. Git, readers and writers work on it at the same time.
class Checkouts : public testing::Test {
protected:
    void SetUp() override {
        Batch all = groupOf(0);
        for (std::size_t folder = 0; folder < folders; ++folder) {
            auto const more = addFiles(manyFiles(filesInFolder, folderName(folder)));
            all.insert(all.end(), more.begin(), more.end());
        }
        auto const values = valueOfMarked(u"0");
        all.insert(all.end(), values.begin(), values.end());
        makeBranches(all);
    }

    void makeBranches(Batch const& all) {
        commit(*open(), all);
        git.commitAll();
        for (std::size_t group = 1; group < groups; ++group) {
            git.run({"switch", "-q", "-c", branch(group), "main"});
            bool const isTail = group > 1;
            root.addFile("work/.projectdata/project.jsonl",
                         isTail ? textOf(all, {groupOf(group)}) : textOf(joined(all, groupOf(group))));
            git.commitAll();
        }
        git.run({"switch", "-q", "main"});
    }

    static Batch joined(Batch first, Batch const& second) {
        first.insert(first.end(), second.begin(), second.end());
        return first;
    }

    static std::string branch(std::size_t number) {
        return number == 0 ? "main" : "group" + std::to_string(number);
    }

    std::unique_ptr<TextBackend> open() const {
        return std::make_unique<TextBackend>(
            stores::makeSystemDisk(root.path(u"work"), TextBackend::folderName));
    }

    std::unique_ptr<TreeMetadataManager> openStore() const {
        return std::make_unique<TreeMetadataManager>(open(), root.path(u"work/.projectdata"));
    }

    /// Runs until the end, or until something is wrong.
    std::unique_ptr<ChildProcess> start(std::function<void(std::mt19937&)> const& act) {
        auto const childSeed = random();
        return std::make_unique<ChildProcess>([this, act, childSeed](ChildProcess::Parent const&) {
            std::mt19937 ownRandom(childSeed);
            try {
                while (!tally->stop) {
                    act(ownRandom);
                }
            } catch (std::exception const& error) {
                std::strncpy(tally->wrong.data(), error.what(), tally->wrong.size() - 1);
                tally->stop = true;
            }
        });
    }

    void require(Sight const& sight) const {
        if (auto const wrong = wrongWith(sight); !wrong.empty()) {
            throw std::runtime_error(wrong);
        }
    }

    unsigned othersSteps() const { return tally->written + tally->gitDid; }

    Sight readTwice(TreeMetadataManager& store) const {
        auto const guard = store.acquireReadLock();
        auto const sight = lookAt(store);
        require(sight);
        auto const before = othersSteps();
        comesTrue([&] { return othersSteps() != before; }, 5ms); // best after a change by another process
        if (lookAt(store) != sight) {
            throw std::runtime_error("the state that a guard shows has changed");
        }
        ++tally->checks;
        return sight;
    }

    /// Sets the three marked files to another value. The write may be refused, but it is never applied
    /// partially.
    void write(TreeMetadataManager& store, std::mt19937& ownRandom) const {
        auto const digits = std::to_string(ownRandom());
        std::map<Address, std::shared_ptr<metadata::MetadataNode>> nodes;
        for (auto const& path : marked) {
            auto node = std::make_shared<MetadataNodeSpecification>(u"Info");
            node->put(u"V", std::u16string(digits.begin(), digits.end()));
            nodes.emplace(fileAddress(path), std::move(node));
        }
        try {
            store.setNodes(nodes);
            ++tally->written;
        } catch (StoreError const& error) {
            // Git may leave a conflict, but never a damaged text.
            if (error.kind() == StoreError::Kind::Damaged) {
                throw;
            }
            ++tally->refused;
        }
    }

    void tryTo(std::vector<std::string> const& arguments) const {
        ++tally->gitDid;
        tally->gitFailed += git.tryTo(arguments).exitCode == 0 ? 0U : 1U;
    }

    void doWithGit(std::mt19937& ownRandom) const {
        auto const here = branch(ownRandom() % groups);
        auto const there = branch(ownRandom() % groups);
        switch (ownRandom() % 5) {
        case 0:
            tryTo({"checkout", "-q", "-f", here});
            break;
        case 1:
            tryTo({"switch", "-q", here});
            break;
        case 2:
            tryTo({"stash", "-q"});
            tryTo({"checkout", "-q", "-f", here});
            tryTo({"stash", "pop", "-q"});
            break;
        case 3:
            tryTo({"checkout", "-q", "-f", "--detach", here});
            tryTo({"merge", "-q", "-m", "merged", there});
            break;
        default:
            tryTo({"clean", "-q", "-xdf"});
        }
        tryTo({"reset", "-q", "--hard"});
        git.tryTo({"stash", "clear"});
    }

    TemporaryFolder root;
    std::filesystem::path const work = root.addFolder("work");
    GitFolder const git{work};
    std::uint64_t const seed = testSeed();
    std::mt19937 random{static_cast<std::mt19937::result_type>(seed)};
    SharedMemory<Tally> tally;
};

TEST_F(Checkouts, withReadersAndWritersShowOnlyWholeVersions) {
    auto const store = openStore();
    auto last = readTwice(*store);
    std::vector<std::unique_ptr<ChildProcess>> processes;
    processes.push_back(start([this](std::mt19937& ownRandom) { doWithGit(ownRandom); }));
    for (int writer = 0; writer < 2; ++writer) {
        processes.push_back(
            start([this, own = std::shared_ptr<TreeMetadataManager>()](std::mt19937& ownRandom) mutable {
                if (!own || ownRandom() % 10 == 0) {
                    own = openStore();
                }
                write(*own, ownRandom);
                std::this_thread::sleep_for(std::chrono::milliseconds(ownRandom() % 10));
            }));
    }
    processes.push_back(start([this](std::mt19937&) { readTwice(*openStore()); }));
    auto const end = std::chrono::steady_clock::now() + std::chrono::seconds(testSeconds(2));
    try {
        while (!tally->stop && std::chrono::steady_clock::now() < end) {
            auto const now = readTwice(*store);
            tally->others += now == last ? 0U : 1U;
            last = now;
        }
    } catch (StoreError const& error) {
        ADD_FAILURE() << error.what();
    } catch (std::runtime_error const& error) {
        ADD_FAILURE() << error.what();
    }
    tally->stop = true;
    for (auto const& process : processes) {
        EXPECT_TRUE(process->join());
    }

    EXPECT_STREQ("", tally->wrong.data());
    std::cout << tally->checks << " checks of readers for changes, of which " << tally->others
              << " found some; " << tally->written << " batches, " << tally->refused << " refused; "
              << tally->gitDid << " commands of git, " << tally->gitFailed << " failed\n";
    EXPECT_GT(tally->others, 0U);
    EXPECT_GT(tally->written, 0U);
    EXPECT_GT(tally->gitDid, tally->gitFailed);
    if (HasFailure()) {
        ADD_FAILURE() << "repeat with PROJECT_TEST_SEED=" << seed;
    }
}

} // namespace

} // namespace project::test

#include "support/RandomProcesses.hpp"

#include <algorithm>
#include <atomic>
#include <cstring>
#include <iostream>
#include <thread>
#include <utility>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/ChildProcess.hpp"
#include "support/Linearizability.hpp"
#include "support/NightlyScale.hpp"
#include "support/SharedMemory.hpp"
#include "support/TextStore.hpp"

namespace project::test {

namespace {

using namespace std::chrono_literals;
using metadata::MetadataNodeSpecification;
using std::chrono::milliseconds;
using stores::TreeMetadataManager;
using Kind = Operation::Kind;

constexpr auto storeFolder = u"/project/.projectdata";

/// One operation of one process, with the moments between which it took place.
struct Record {
    std::uint64_t begin = 0;
    std::uint64_t end = 0;  ///< 0 until it ends
    std::uint64_t died = 0; ///< when its process was known to be dead; 0 when the operation ended
    Operation operation;
};

/// The operations of consecutive processes. The last record stays when its process is killed.
struct Lane {
    static constexpr std::uint32_t most = 1U << 16U;

    std::atomic<std::uint32_t> count;
    std::array<Record, most> records;
    std::array<char, 400> error; ///< why its process ended early
};

/// The memory that all processes share.
struct History {
    std::atomic<bool> stop;
    std::atomic<std::uint64_t> clock;
    std::atomic<std::uint32_t> values;
    std::array<Lane, Linearizability::lanes> lanes;
};

Address addressOfSlot(std::size_t slot) {
    std::u16string path(1, static_cast<char16_t>(u'a' + slot / Slots::inGroup));
    if (slot % Slots::inGroup != 0) {
        path += slot % Slots::inGroup == 1 ? u"/x" : u"/y";
    }
    return fileAddress(path);
}

std::uint32_t valueAt(TreeMetadataManager& store, std::size_t slot) {
    auto const address = addressOfSlot(slot);
    auto const node = store.getNode(address);
    if (!node) {
        return store.pathExists(address) ? Slots::created : Slots::nothing;
    }
    auto const text = node->get(u"V");
    return static_cast<std::uint32_t>(std::stoul(std::string(text.begin(), text.end())));
}

/// The values that one guard shows.
Slots readSlots(TreeMetadataManager& store, std::mt19937& random) {
    auto const guard = store.acquireReadLock();
    std::array<std::size_t, Slots::count> order{0, 1, 2, 3, 4, 5, 6, 7, 8};
    std::shuffle(order.begin(), order.end(), random);
    Slots seen{};
    for (auto const slot : order) {
        seen.values[slot] = valueAt(store, slot);
    }
    for (auto const slot : order) {
        if (valueAt(store, slot) != seen.values[slot]) {
            throw std::runtime_error("the state that a guard shows has changed");
        }
    }
    return seen;
}

/// A process that runs random operations on its own store object.
class RandomProcess {
public:
    RandomProcess(RandomProcesses::Store const& opened, History& history, std::size_t lane,
                  std::mt19937::result_type seed)
        : opened_(opened), history_(history), lane_(history.lanes[lane]), number_(lane), random_(seed) {
        open();
    }

    void run() {
        try {
            while (!history_.stop && lane_.count < Lane::most) {
                act();
            }
        } catch (std::exception const& error) {
            std::strncpy(lane_.error.data(), error.what(), lane_.error.size() - 1);
            throw;
        }
    }

private:
    std::uint32_t below(std::uint32_t limit) { return static_cast<std::uint32_t>(random_() % limit); }

    void open() {
        auto backend = opened_.open(number_, random_);
        backend_ = backend.get();
        store_.reset();
        store_ = std::make_unique<TreeMetadataManager>(std::move(backend), storeFolder);
    }

    void act() {
        auto const choice = below(100);
        if (choice < 3) {
            store_.reset();
            open();
        } else if (choice < 5) {
            opened_.tidy(*backend_);
        } else if (choice < 45) {
            auto& record = begin({.kind = Kind::Read, .hasSeen = true});
            record.operation.seen = readSlots(*store_, random_);
            end(record);
        } else {
            write();
        }
    }

    void write() {
        auto const choice = below(10);
        auto const mask = static_cast<std::uint16_t>(
            (1U << below(Slots::count)) | (1U << below(Slots::count)) | (1U << below(Slots::count)));
        auto const kind = choice < 7 ? Kind::Set : choice < 9 ? Kind::Remove : Kind::Create;
        bool const readsFirst = below(4) > 0;
        // Set only after the read: a process that dies during the read has seen nothing.
        auto& record = begin({.kind = kind, .mask = mask, .value = ++history_.values});
        auto const guard = store_->acquireWriteLock();
        if (readsFirst) {
            record.operation.seen = readSlots(*store_, random_);
            std::atomic_signal_fence(std::memory_order_seq_cst);
            record.operation.hasSeen = true;
        }
        apply(record.operation);
        end(record);
    }

    void apply(Operation const& operation) {
        std::map<Address, std::shared_ptr<metadata::MetadataNode>> nodes;
        std::vector<Address> addresses;
        auto const digits = std::to_string(operation.value);
        for (std::size_t slot = 0; slot < Slots::count; ++slot) {
            if ((operation.mask & (1U << slot)) != 0) {
                auto node = std::make_shared<MetadataNodeSpecification>(u"Info");
                node->put(u"V", std::u16string(digits.begin(), digits.end()));
                nodes.emplace(addressOfSlot(slot), std::move(node));
                addresses.push_back(addressOfSlot(slot));
            }
        }
        if (operation.kind == Kind::Set) {
            store_->setNodes(nodes);
        } else if (operation.kind == Kind::Remove) {
            store_->removeNodes(addresses);
        } else {
            store_->createPaths(addresses);
        }
    }

    Record& begin(Operation const& operation) {
        auto& record = lane_.records[lane_.count];
        record = {.operation = operation};
        record.begin = ++history_.clock;
        ++lane_.count;
        return record;
    }

    void end(Record& record) { record.end = ++history_.clock; }

    RandomProcesses::Store const& opened_;
    History& history_;
    Lane& lane_;
    std::size_t number_;
    std::mt19937 random_;
    stores::Backend* backend_ = nullptr;
    std::unique_ptr<TreeMetadataManager> store_;
};

/// The begin or the end of a record.
struct Moment {
    std::uint64_t time;
    std::size_t lane;
    Record const* record;
};

std::vector<Moment> momentsOf(History const& history) {
    std::vector<Moment> moments;
    for (std::size_t lane = 0; lane < Linearizability::lanes; ++lane) {
        for (std::uint32_t index = 0; index < history.lanes[lane].count; ++index) {
            auto const& record = history.lanes[lane].records[index];
            if (record.operation.kind == Kind::Read && record.end == 0) {
                continue; // the values that it saw are unknown
            }
            moments.push_back({record.begin, lane, &record});
            moments.push_back({record.end != 0 ? record.end : record.died, lane, &record});
        }
    }
    std::sort(moments.begin(), moments.end(),
              [](Moment const& left, Moment const& right) { return left.time < right.time; });
    return moments;
}

/// The first operation, by its lane and its moments, after which the history is not linearizable. Empty when
/// the whole history is.
std::string findNonLinearizable(History const& history) {
    Linearizability order(Slots{});
    for (auto const& moment : momentsOf(history)) {
        auto const& record = *moment.record;
        if (moment.time == record.begin) {
            order.begin(moment.lane, record.operation);
        } else if (record.end == 0) {
            order.die(moment.lane);
        } else if (!order.end(moment.lane)) {
            return "process " + std::to_string(moment.lane) + ", from " + std::to_string(record.begin) +
                   " to " + std::to_string(record.end);
        }
    }
    return {};
}

using Processes = std::vector<std::unique_ptr<ChildProcess>>;

} // namespace

RandomProcesses::RandomProcesses(Store store)
    : store_(std::move(store)),
      seed_(testSeed()),
      random_(static_cast<std::mt19937::result_type>(seed_)),
      lastValue_(Slots::created) {
}

void RandomProcesses::runFor(milliseconds usual, Deaths deaths) {
    auto const asked = std::chrono::seconds(testSeconds(0));
    auto const end = std::chrono::steady_clock::now() + std::max<milliseconds>(asked, usual);
    while (std::chrono::steady_clock::now() < end && !testing::Test::HasFailure()) {
        runRound(std::min<milliseconds>(usual, 2s), deaths);
    }
    std::cout << operations_ << " operations of " << Linearizability::lanes << " processes, " << deaths_
              << " deaths\n";
    if (testing::Test::HasFailure()) {
        ADD_FAILURE() << "repeat with PROJECT_TEST_SEED=" << seed_;
    }
}

/// A reader cannot distinguish a created address from one that only has children, so each round begins with
/// empty slots.
void RandomProcesses::emptySlots() {
    TreeMetadataManager store(store_.open(0, random_), storeFolder);
    std::vector<Address> tops;
    for (std::size_t slot = 0; slot < Slots::count; slot += Slots::inGroup) {
        tops.push_back(addressOfSlot(slot));
    }
    store.removeNodes(tops);
}

void RandomProcesses::runRound(milliseconds time, Deaths deaths) {
    SharedMemory<History> history;
    history->values = lastValue_;
    emptySlots();
    auto const start = [&](std::size_t lane) {
        auto const seed = random_();
        return std::make_unique<ChildProcess>([this, &history, lane, seed](ChildProcess::Parent const&) {
            RandomProcess(store_, *history, lane, seed).run();
        });
    };
    Processes processes;
    for (std::size_t lane = 0; lane < Linearizability::lanes; ++lane) {
        processes.push_back(start(lane));
    }
    auto const end = std::chrono::steady_clock::now() + time;
    while (std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(milliseconds(5 + random_() % 20));
        if (deaths == Deaths::Some) {
            auto const lane = random_() % processes.size();
            processes[lane]->kill();
            store_.awaitDeath(lane);
            auto& done = history->lanes[lane];
            if (done.count > 0 && done.records[done.count - 1].end == 0) {
                done.records[done.count - 1].died = ++history->clock;
            }
            processes[lane] = start(lane);
            ++deaths_;
        }
    }
    history->stop = true;
    for (std::size_t lane = 0; lane < Linearizability::lanes; ++lane) {
        EXPECT_TRUE(processes[lane]->join()) << history->lanes[lane].error.data();
        operations_ += history->lanes[lane].count;
    }
    EXPECT_EQ("", findNonLinearizable(*history));
    lastValue_ = history->values;
}

} // namespace project::test

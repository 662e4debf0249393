#include <algorithm>
#include <array>
#include <ostream>
#include <utility>

#include <rapidcheck.h>

#include "project/stores/TreeMetadataManager.hpp"
#include "support/TextGenerators.hpp"
#include "support/TextStore.hpp"
#include "support/TreeModel.hpp"

namespace project::test {

namespace {

using stores::Node;
using stores::TreeMetadataManager;

struct Step {
    enum class Kind { Set, Remove, Create, Transaction, Reopen, Tidy, Check, PowerCut };

    Kind kind = Kind::Check;
    std::size_t process = 0; ///< the process that takes it
    std::map<Address, Node> nodes{};
    std::vector<Address> addresses{};
    std::vector<PartialWrite> writes{}; ///< of a transaction
    bool isCommitted = true;            ///< of a transaction
    CrashingVolume::InjectedFault fault = CrashingVolume::InjectedFault::None;
    std::size_t callsBefore = 0; ///< the calls before the fault
};

void showValue(Step const& step, std::ostream& out) {
    constexpr char const* kinds[] = {"Set",    "Remove", "Create", "Transaction",
                                     "Reopen", "Tidy",   "Check",  "PowerCut"};
    constexpr char const* faults[] = {"", "fails", "fails permanently", "dies"};
    out << kinds[static_cast<int>(step.kind)] << " by " << step.process;
    if (step.fault != CrashingVolume::InjectedFault::None) {
        out << ", " << faults[static_cast<int>(step.fault)] << " after " << step.callsBefore << " calls";
    }
    showWrite(step.nodes, step.addresses, out);
    for (auto const& write : step.writes) {
        showValue(write, out);
    }
    out << (step.isCommitted ? "\n" : "\n  rolled back\n");
}

rc::Gen<Step> anyStep() {
    using Kind = Step::Kind;
    using InjectedFault = CrashingVolume::InjectedFault;
    return rc::gen::build<Step>(
        rc::gen::set(&Step::kind, rc::gen::weightedElement<Kind>({{10, Kind::Set},
                                                                  {4, Kind::Remove},
                                                                  {2, Kind::Create},
                                                                  {6, Kind::Transaction},
                                                                  {1, Kind::Reopen},
                                                                  {1, Kind::Tidy},
                                                                  {2, Kind::Check},
                                                                  {1, Kind::PowerCut}})),
        rc::gen::set(&Step::process, rc::gen::inRange<std::size_t>(0, 2)),
        rc::gen::set(&Step::nodes, anyNodes()),
        rc::gen::set(&Step::addresses, stores::samples::fewOf(3, stores::samples::anyAddress())),
        rc::gen::set(&Step::writes, stores::samples::fewOf(5, anyPartialWrite())),
        rc::gen::set(&Step::isCommitted, rc::gen::weightedElement<bool>({{4, true}, {1, false}})),
        rc::gen::set(&Step::fault, rc::gen::weightedElement<InjectedFault>({{12, InjectedFault::None},
                                                                            {2, InjectedFault::Fails},
                                                                            {1, InjectedFault::FailsForGood},
                                                                            {3, InjectedFault::Dies}})),
        rc::gen::set(&Step::callsBefore, rc::gen::inRange<std::size_t>(0, 25)));
}

/// Two processes on one project, and the expected content of the project.
class Processes {
public:
    Processes(TextBackend::Options options, unsigned seed)
        : options_(options), volume_(std::make_shared<CrashingVolume>(seed)) {
        reopen(0);
        reopen(1);
    }

    void take(Step const& step) {
        volume_->advance(3'000'000); // so that some steps share a tick and some do not
        volume_->plan(step.fault, step.callsBefore);
        TreeModel after = model_;
        bool isDone = false;
        bool hasDied = false;
        bool isUnknown = false;
        auto const earlierAppends = appends();
        try {
            perform(step, after);
            isDone = true;
        } catch (StoreError const& error) {
            require(step.fault != CrashingVolume::InjectedFault::None, error.what());
            isUnknown = error.kind() == StoreError::Kind::OutcomeUnknown;
        } catch (ProcessDied const&) {
            hasDied = true;
        }
        volume_->cancelPlan();
        if (isDone && after.content() != model_.content()) {
            noteDurability(appends() > earlierAppends);
            model_ = after;
        }
        mayLackName_ =
            mayLackName_ || (isUnknown && step.fault == CrashingVolume::InjectedFault::FailsForGood);
        if (step.kind == Step::Kind::PowerCut || (hasDied && step.callsBefore % 2 == 0)) {
            cutPower(after);
        } else if (hasDied || isUnknown) {
            reopenDead(step.process);
            acceptOutcome(after);
        }
        check(step.process);
        // A power cut can remove the torn tail of an old text beside the new one. The store cannot detect
        // that, and sets the old text aside.
        require(hadPowerCut_ || volume_->namesLike("displaced-").empty(), "something was set aside");
    }

    /// Both processes close, and a third one reads and writes the project.
    void finish() {
        check(0);
        check(1);
        trees_[0].reset();
        trees_[1].reset();
        reopen(0);
        check(0);
        backends_[0]->tidy(); // a writer, which deletes the leftovers of dead ones
        check(0);
        for (auto const& name : volume_->names()) {
            require(name == ".gitattributes" || name == ".gitignore" || name == "project.jsonl" ||
                        (hadPowerCut_ && name.starts_with("displaced-")) ||
                        (repairs_ > 0 && name.starts_with("damaged-")),
                    "something was left in the folder");
        }
    }

    CrashingVolume& disk() { return *volume_; }

    /// The number of appends, so that a run without any is detected.
    std::size_t appends() const { return volume_->count("append project.jsonl"); }

    std::size_t rewrites() const { return volume_->count("exchange swapping project.jsonl"); }

    /// The number of power cuts that left a damaged text.
    std::size_t repairs() const { return repairs_; }

private:
    void reopen(std::size_t process) {
        trees_.at(process).reset();
        auto backend = std::make_unique<TextBackend>(std::make_unique<CrashingDisk>(volume_), options_);
        backends_.at(process) = backend.get();
        trees_.at(process) =
            std::make_unique<TreeMetadataManager>(std::move(backend), u"/project/.projectdata");
    }

    void perform(Step const& step, TreeModel& after) {
        auto& tree = *trees_.at(step.process);
        switch (step.kind) {
        case Step::Kind::Set:
            write(tree, {.kind = PartialWrite::Kind::Set, .nodes = step.nodes}, after);
            break;
        case Step::Kind::Remove:
            write(tree, {.kind = PartialWrite::Kind::Remove, .addresses = step.addresses}, after);
            break;
        case Step::Kind::Create:
            write(tree, {.kind = PartialWrite::Kind::Create, .addresses = step.addresses}, after);
            break;
        case Step::Kind::Transaction:
            runTransaction(tree, step.writes, step.isCommitted, after);
            break;
        case Step::Kind::Reopen:
            reopen(step.process);
            break;
        case Step::Kind::Tidy:
            backends_.at(step.process)->tidy();
            break;
        case Step::Kind::Check:
            static_cast<void>(tree.pathExists(fileAddress(u"a")));
            break;
        case Step::Kind::PowerCut:
            break;
        }
    }

    /// A committed batch is durable, with one exception, which the store does not promise: it was appended
    /// to a text whose name may not be durable.
    void noteDurability(bool isAppended) {
        if (mayLackName_ && isAppended) {
            notDurable_.push_back(model_);
        } else {
            notDurable_.clear();
            mayLackName_ = false;
        }
    }

    /// The process has died: the destructors of its objects must not change the disk.
    void reopenDead(std::size_t process) {
        volume_->plan(CrashingVolume::InjectedFault::Dies, 0);
        trees_.at(process).reset();
        volume_->cancelPlan();
        reopen(process);
    }

    /// After the death of a process its batch is in the project or not, and all processes see the same. Until
    /// the next committed batch, a power cut may restore the other state.
    void acceptOutcome(TreeModel const& after) {
        auto const found = contentOf(*trees_[0]);
        bool const isBefore = found == model_.visible();
        require(isBefore || found == after.visible(),
                "the project equals neither the state before the step nor the one after it");
        notDurable_.push_back(isBefore ? after : model_);
        if (!isBefore) {
            model_ = after;
        }
    }

    void cutPower(TreeModel const& after) {
        volume_->powerCut();
        hadPowerCut_ = true;
        bool const mayBeDamaged = std::exchange(mayLackName_, false);
        reopenDead(0);
        reopenDead(1);
        auto possible = std::exchange(notDurable_, {});
        possible.push_back(after);
        possible.push_back(model_);
        if (mayBeDamaged && !backends_[0]->repair().empty()) {
            ++repairs_;
            acceptRest(possible);
            return;
        }
        auto const found = contentOf(*trees_[0]);
        auto const match = std::find_if(possible.begin(), possible.end(),
                                        [&](TreeModel const& model) { return found == model.visible(); });
        require(match != possible.end(), "the power cut lost a committed batch, or left a part of one");
        model_ = *match;
    }

    /// The text contained batches of other processes after one that the disk had lost, and was repaired. The
    /// lost batch may take them with it, but nothing else, and nothing is in the project that never was.
    void acceptRest(std::vector<TreeModel> const& possible) {
        reopen(0);
        auto const found = contentOf(*trees_[0]);
        for (auto const& entry : found) {
            require(std::ranges::any_of(possible,
                                        [&entry](TreeModel const& model) {
                                            auto const visible = model.visible();
                                            auto const same = visible.find(entry.first);
                                            return same != visible.end() && *same == entry;
                                        }),
                    "a repaired project contains something that it never did");
        }
        for (auto const& entry : possible.front().visible()) { // before the lost batch and those after it
            bool const isInAll = std::ranges::all_of(
                possible, [&entry](TreeModel const& model) { return model.visible().contains(entry.first); });
            require(!isInAll || found.contains(entry.first), "a repair lost something that was durable");
        }
        model_ = TreeModel(found);
    }

    void check(std::size_t process) { requireEqual(*trees_.at(process), model_); }

    TextBackend::Options const options_;
    std::shared_ptr<CrashingVolume> const volume_;
    std::array<TextBackend*, 2> backends_{};
    std::array<std::unique_ptr<TreeMetadataManager>, 2> trees_;
    TreeModel model_;
    bool hadPowerCut_ = false;
    std::size_t repairs_ = 0;
    /// A disk that failed for good could sync neither the folder nor a new text, nor mark the text as torn.
    bool mayLackName_ = false;
    std::vector<TreeModel> notDurable_; ///< contents that a power cut may restore
};

TEST(TextBackendModel, afterAnyHistoryOfTwoProcessesAProjectEqualsAPlainMap) {
    std::size_t appends = 0;
    std::size_t rewrites = 0;

    auto const holds = [&] {
        // On both sides of each limit: texts here have some hundreds to some thousands of bytes.
        auto const alwaysRewritten = *rc::gen::element<std::size_t>(0, 400, 1'500, 1'000'000);
        auto const bodyToTail = *rc::gen::element<std::size_t>(1, 2, 16);
        Processes processes({.patience = std::chrono::milliseconds(20),
                             .alwaysRewritten = alwaysRewritten,
                             .bodyToTail = bodyToTail},
                            *rc::gen::arbitrary<unsigned>());
        processes.disk().canExchange = *rc::gen::arbitrary<bool>();
        processes.disk().keepsStamps = *rc::gen::arbitrary<bool>();
        auto const count = *rc::gen::inRange<std::size_t>(1, 50);
        auto const steps = *rc::gen::container<std::vector<Step>>(count, anyStep());
        for (auto const& step : steps) {
            processes.take(step);
        }
        processes.finish();
        appends += processes.appends();
        rewrites += processes.rewrites();
    };

    for (int hundred = 0; hundred < 3; ++hundred) {
        EXPECT_TRUE(rc::check(holds));
    }
    EXPECT_GT(appends, 100U);
    EXPECT_GT(rewrites, 100U);
}

/// An append whose sync fails permanently, a rewrite over it, and a power cut that restores the old text
/// without the append: it must not be taken for a text of another program.
TEST(TextBackendModel, anOldTextTornByAPowerCutDoesNotReplaceTheNewOne) {
    using Kind = Step::Kind;
    using InjectedFault = CrashingVolume::InjectedFault;
    auto const head = Address::root().child(metadata::PathElement(u"Files", u"Root"));
    auto const below = head.child(metadata::PathElement(u"DIR_SIGNIFIER", u"1"));
    auto const other = Address::root().child(metadata::PathElement(u"LabelData", u""));
    for (unsigned seed = 0; seed < 100; ++seed) {
        Processes processes(
            {.patience = std::chrono::milliseconds(20), .alwaysRewritten = 0, .bodyToTail = 1}, seed);
        processes.take({.kind = Kind::Set,
                        .process = 1,
                        .nodes = {{below, stores::plainNode()}, {other, stores::plainNode()}}});
        processes.take({.kind = Kind::Remove,
                        .addresses = {head},
                        .fault = InjectedFault::FailsForGood,
                        .callsBefore = 10});
        processes.take({.kind = Kind::Set, .nodes = {{head, stores::plainNode()}}});
        processes.take({.kind = Kind::PowerCut});
        processes.finish();
    }
}

/// The disk fails while a batch is synced, and accepts not even a torn tail, so that the next processes
/// append to a batch that a power cut tears. The store does not promise these batches; it reports the damage,
/// and all that was durable before can be repaired.
TEST(TextBackendModel, batchesAfterOneThatAFailedDiskHasLostAreDamageThatCanBeRepaired) {
    using Kind = Step::Kind;
    std::size_t repairs = 0;
    auto const add = [](std::u16string const& name, std::size_t process) {
        return Step{
            .kind = Kind::Set, .process = process, .nodes = {{fileAddress(name), stores::plainNode()}}};
    };
    for (unsigned seed = 0; seed < 40; ++seed) {
        Processes processes(
            {.patience = std::chrono::milliseconds(20), .alwaysRewritten = 0, .bodyToTail = 1}, seed);
        Step many{.kind = Kind::Set};
        for (auto const& path : manyFiles(30, u"folder")) {
            many.nodes.emplace(fileAddress(path), stores::plainNode());
        }
        processes.take(many);
        auto lost = add(u"one", 0);
        lost.fault = CrashingVolume::InjectedFault::FailsForGood;
        lost.callsBefore = 8; // the sync of the append
        processes.take(lost);
        processes.take(add(u"two", 1));
        processes.take({.kind = Kind::Remove,
                        .process = 1,
                        .addresses = {fileAddress(u"one"), fileAddress(u"two")}}); // the content is as before
        processes.take({.kind = Kind::PowerCut});
        processes.take(add(u"three", 0));
        processes.finish();
        repairs += processes.repairs();
    }
    EXPECT_GT(repairs, 10U);
}

TEST(TextBackendModel, theSameHoldsForTextsWithTheRealLimits) {
    std::size_t appends = 0;
    std::size_t rewrites = 0;
    for (unsigned seed = 1; seed <= 3; ++seed) {
        Processes processes({}, seed);
        Step many{.kind = Step::Kind::Set};
        auto const folder = std::u16string(200, u'x'); // long, so that few nodes make a long text
        for (auto const& path : manyFiles(1'400, folder)) {
            many.nodes.emplace(fileAddress(path), stores::plainNode());
        }
        processes.take(many);
        auto const start = processes.rewrites();
        auto step = many;
        for (unsigned turn = 0; turn < 6; ++turn) {
            step = anyStep()(rc::Random(seed * 100 + turn), 50).value();
            auto const size = std::size_t{1} << (turn * 2); // from one file to more than the tail may hold
            for (auto const& path : manyFiles(size, folder + char16_t(u'a' + turn))) {
                step.nodes.emplace(fileAddress(path), stores::plainNode());
            }
            step.kind = Step::Kind::Set;
            processes.take(step);
        }
        processes.finish();
        appends += processes.appends();
        rewrites += processes.rewrites() - start;
    }
    EXPECT_GT(appends, 3U);
    EXPECT_GT(rewrites, 3U);
}

} // namespace

} // namespace project::test

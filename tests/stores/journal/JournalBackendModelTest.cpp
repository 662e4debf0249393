#include <algorithm>
#include <array>
#include <map>
#include <set>
#include <utility>

#include <rapidcheck.h>

#include "support/JournalStore.hpp"
#include "support/TextGenerators.hpp"
#include "support/TreeModel.hpp"

namespace project::test {

namespace {

using stores::HistoryLoss;
using stores::JournalPosition;
using stores::TreeMetadataManager;
using InjectedFault = JournalServer::InjectedFault;

constexpr std::size_t clients = 3;

struct Step {
    enum class Kind { Write, Transaction, Reopen, Tidy, DeleteHistory, Reset, Check };

    Kind kind = Kind::Check;
    std::size_t client = 0;
    std::vector<PartialWrite> writes{}; ///< of a transaction, or one
    bool isCommitted = true;            ///< of a transaction
    std::size_t lost = 0;               ///< the number of entries that a reset loses
    InjectedFault fault = InjectedFault::None;
    std::size_t callsBefore = 0; ///< the calls before the fault
};

void showValue(Step const& step, std::ostream& out) {
    constexpr char const* kinds[] = {"Write",         "Transaction", "Reopen", "Tidy",
                                     "DeleteHistory", "Reset",       "Check"};
    constexpr char const* faults[] = {"",           "LostBefore", "LostAfter",  "Unreachable", "Stalls",
                                      "StallsLate", "DiskFull",   "DiesBefore", "DiesAfter"};
    out << kinds[static_cast<int>(step.kind)] << " by " << step.client << ", loses " << step.lost;
    if (step.fault != InjectedFault::None) {
        out << ", " << faults[static_cast<int>(step.fault)] << " after " << step.callsBefore << " calls";
    }
    for (auto const& write : step.writes) {
        showValue(write, out);
    }
    out << (step.isCommitted ? "\n" : "\n  rolled back\n");
}

rc::Gen<InjectedFault> anyFault() {
    return rc::gen::weightedElement<InjectedFault>({{16, InjectedFault::None},
                                                    {1, InjectedFault::LostBefore},
                                                    {1, InjectedFault::LostAfter},
                                                    {1, InjectedFault::Unreachable},
                                                    {1, InjectedFault::Stalls},
                                                    {2, InjectedFault::StallsLate},
                                                    {1, InjectedFault::DiskFull},
                                                    {1, InjectedFault::DiesBefore},
                                                    {1, InjectedFault::DiesAfter}});
}

rc::Gen<Step> anyStep() {
    using Kind = Step::Kind;
    return rc::gen::build<Step>(
        rc::gen::set(&Step::kind, rc::gen::weightedElement<Kind>({{16, Kind::Write},
                                                                  {6, Kind::Transaction},
                                                                  {1, Kind::Reopen},
                                                                  {1, Kind::Tidy},
                                                                  {1, Kind::DeleteHistory},
                                                                  {1, Kind::Reset},
                                                                  {3, Kind::Check}})),
        rc::gen::set(&Step::client, rc::gen::inRange<std::size_t>(0, clients)),
        rc::gen::set(&Step::writes, rc::gen::mapcat(rc::gen::inRange<std::size_t>(1, 5),
                                                    [](std::size_t count) {
                                                        return rc::gen::container<std::vector<PartialWrite>>(
                                                            count, anyPartialWrite());
                                                    })),
        rc::gen::set(&Step::isCommitted, rc::gen::weightedElement<bool>({{4, true}, {1, false}})),
        rc::gen::set(&Step::lost, rc::gen::inRange<std::size_t>(0, 5)),
        rc::gen::set(&Step::fault, anyFault()),
        rc::gen::set(&Step::callsBefore, rc::gen::inRange<std::size_t>(0, 5)));
}

/// A few clients of one project, and the expected content of the project.
class Clients {
public:
    Clients(JournalBackend::Options options, bool hasCache) : options_(options), hasCache_(hasCache) {
        for (std::size_t client = 0; client < clients; ++client) {
            reopen(client);
        }
    }

    void take(Step const& step) {
        newestBefore_ = newestVersion();
        server_->plan(step.fault, step.callsBefore);
        TreeModel after = model_;
        Outcome outcome = Outcome::Failed;
        bool isAlive = true;
        // A client checks for changes before it deletes history itself.
        auto expectedLoss = lossOf(step.client);
        bool const mustFail = expectedLoss == HistoryLoss::Kind::Reset;
        try {
            perform(step, after);
            outcome = Outcome::Done;
        } catch (StoreError const& error) {
            bool const isRefused = error.kind() == StoreError::Kind::Refused && mustFail;
            require(step.fault != InjectedFault::None || isRefused, error.what());
            outcome = error.kind() == StoreError::Kind::OutcomeUnknown ? Outcome::Unknown : Outcome::Failed;
        } catch (ProcessDied const&) {
            outcome = Outcome::Unknown;
            reopenDead(step.client);
            isAlive = false;
        }
        server_->cancelPlan();
        if (step.kind == Step::Kind::Reset || step.kind == Step::Kind::Reopen || !isAlive) {
            expectedLoss = lossOf(step.client);
        }
        if (step.kind != Step::Kind::Reset) {
            accept(outcome, after);
        }
        check(step.client, expectedLoss,
              step.kind == Step::Kind::Write || step.kind == Step::Kind::Transaction);
    }

    /// All clients and a new one see the same.
    void finish() {
        for (std::size_t client = 0; client < clients; ++client) {
            check(client, lossOf(client));
        }
        reopen(0);
        check(0, lossOf(0));
        requireSoundLog();
    }

    std::size_t batches() const { return batches_; }

    std::size_t bodies() const { return bodies_; }

    std::size_t losses() const { return losses_; }

    std::size_t lateBatches() const { return lateBatches_; }

private:
    enum class Outcome { Done, Failed, Unknown };

    void reopen(std::size_t client) {
        trees_.at(client).reset();
        auto& saved = saved_.at(client);
        auto backend =
            std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server_), options_,
                                             hasCache_ ? std::make_unique<MemoryCache>(saved) : nullptr);
        backends_.at(client) = backend.get();
        trees_.at(client) =
            std::make_unique<TreeMetadataManager>(std::move(backend), u"/project/.projectdata");
        seen_.at(client) = hasCache_ && saved->cached ? saved->cached->position : JournalPosition();
    }

    void reopenDead(std::size_t client) {
        saved_.at(client)->isFrozen = true;
        trees_.at(client).reset();
        saved_.at(client)->isFrozen = false;
        reopen(client);
    }

    void perform(Step const& step, TreeModel& after) {
        auto& tree = *trees_.at(step.client);
        auto& backend = *backends_.at(step.client);
        switch (step.kind) {
        case Step::Kind::Write:
            write(tree, step.writes.front(), after);
            break;
        case Step::Kind::Transaction:
            runTransaction(tree, step.writes, step.isCommitted, after);
            break;
        case Step::Kind::Reopen:
            reopen(step.client);
            break;
        case Step::Kind::Tidy:
            backend.tidy();
            break;
        case Step::Kind::DeleteHistory:
            backend.deleteHistory();
            break;
        case Step::Kind::Reset:
            reset(step.lost);
            break;
        case Step::Kind::Check:
            static_cast<void>(tree.pathExists(fileAddress(u"a")));
            break;
        }
    }

    /// The log before its newest body may have been deleted, so a reset leads to a version that is still
    /// there.
    void reset(std::size_t lost) {
        auto const newest = newestVersion();
        auto const oldest = server_->entries().empty() ? 0 : server_->entries().front().read.position.version;
        auto const version = std::max<std::uint64_t>(newest - std::min<std::uint64_t>(newest, lost), oldest);
        server_->resetTo(version);
        newestBefore_ = version;
        model_ = contents_[version];
        mayComeLate_.reset();
    }

    void accept(Outcome outcome, TreeModel const& after) {
        bool const isChange = after.content() != model_.content();
        if (outcome == Outcome::Done && isChange) {
            model_ = after;
            mayComeLate_.reset();
        } else if (outcome == Outcome::Unknown && isChange) {
            adopt(after);
        }
        if (mayComeLate_ && stored() == mayComeLate_->visible()) {
            ++lateBatches_;
            model_ = *std::exchange(mayComeLate_, std::nullopt);
        }
        noteNewEntries();
    }

    /// After an unknown outcome the batch is in the project or not, or it is stored later, if no other batch
    /// is stored before it.
    void adopt(TreeModel const& after) {
        auto const found = stored();
        if (found == after.visible()) {
            model_ = after;
        } else {
            require(found == model_.visible(),
                    "the project equals neither the state before the step nor the one after it");
            mayComeLate_ = after;
        }
    }

    /// The content that a new client reads.
    Content stored() const {
        TreeMetadataManager tree(
            std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server_), options_),
            u"/project/.projectdata");
        return contentOf(tree);
    }

    void noteNewEntries() {
        for (auto const& entry : server_->entries()) {
            if (ids_.insert(entry.read.position.id).second) {
                (entry.read.isBody ? bodies_ : batches_) += 1;
            }
        }
        contents_[newestVersion()] = model_;
    }

    std::uint64_t newestVersion() const {
        return server_->entries().empty() ? 0 : server_->entries().back().read.position.version;
    }

    /// The loss that the server's entries show for a client.
    std::optional<HistoryLoss::Kind> lossOf(std::size_t client) const {
        auto const& seen = seen_.at(client);
        auto const& entries = server_->entries();
        auto const found = std::find_if(entries.begin(), entries.end(), [&](auto const& entry) {
            return entry.read.position.version >= seen.version;
        });
        if (seen.version == 0 || (found != entries.end() && found->read.position == seen)) {
            return std::nullopt;
        }
        bool const isCleaned = found != entries.end() && found->read.position.version > seen.version;
        return isCleaned ? HistoryLoss::Kind::Cleaned : HistoryLoss::Kind::Reset;
    }

    void check(std::size_t client, std::optional<HistoryLoss::Kind> expected, bool mayHaveWritten = false) {
        auto& tree = *trees_.at(client);
        requireEqual(tree, model_);
        auto const loss = backends_.at(client)->takeHistoryLoss();
        require(loss.has_value() == expected.has_value(), "a loss is not reported, or was none");
        if (loss) {
            ++losses_;
            require(loss->kind == *expected, "another loss is reported");
            require(loss->found >= newestBefore_ && loss->found <= newestVersion(),
                    "another version is reported");
        }
        auto const changes = tree.takeOthersChanges();
        if (!mayHaveWritten) { // a later write of this client may have replaced a change of others
            checkOthersChanges(changes);
        }
        seen_.at(client) =
            server_->entries().empty() ? JournalPosition() : server_->entries().back().read.position;
        requireSoundLog();
    }

    void checkOthersChanges(stores::Changes const& changes) {
        for (auto const& difference : changes.differences) {
            auto const now = model_.content().find(difference.address);
            bool const hasNode = now != model_.content().end() && now->second != "created";
            require(hasNode == (difference.after != nullptr), "a difference shows another node");
            require(!hasNode || now->second == stores::samples::described(*difference.after),
                    "a difference shows another node");
        }
    }

    void requireSoundLog() const {
        std::set<std::string> ids;
        stores::JournalEntry const* previous = nullptr;
        for (auto const& entry : server_->entries()) {
            require(ids.insert(entry.read.position.id).second, "an entry is stored twice");
            require(previous == nullptr || (entry.read.position.version == previous->position.version + 1 &&
                                            entry.read.after == previous->position.sum),
                    "the entries are not chained");
            previous = &entry.read;
        }
    }

    JournalBackend::Options const options_;
    bool const hasCache_;
    std::shared_ptr<JournalServer> const server_ = std::make_shared<JournalServer>();
    std::array<std::shared_ptr<SavedText>, clients> saved_{
        std::make_shared<SavedText>(), std::make_shared<SavedText>(), std::make_shared<SavedText>()};
    std::array<JournalBackend*, clients> backends_{};
    std::array<std::unique_ptr<TreeMetadataManager>, clients> trees_;
    std::array<JournalPosition, clients> seen_; ///< at the last check of each client
    TreeModel model_;
    std::optional<TreeModel> mayComeLate_;        ///< the content if a batch is still stored
    std::map<std::uint64_t, TreeModel> contents_; ///< by version
    std::set<std::string> ids_;
    std::uint64_t newestBefore_ = 0; ///< the newest version before the current step
    std::size_t batches_ = 0;
    std::size_t bodies_ = 0;
    std::size_t losses_ = 0;
    std::size_t lateBatches_ = 0;
};

TEST(JournalBackendModel, afterAnyHistoryOfSeveralClientsAProjectEqualsAPlainMap) {
    std::size_t batches = 0;
    std::size_t bodies = 0;
    std::size_t losses = 0;
    std::size_t lateBatches = 0;

    auto const holds = [&] {
        auto const shortTail = *rc::gen::element<std::size_t>(0, 400, 1'500, 65'536);
        auto const bodyToTail = *rc::gen::element<std::size_t>(1, 2, 16);
        Clients all(
            {.patience = std::chrono::milliseconds(1), .shortTail = shortTail, .bodyToTail = bodyToTail},
            *rc::gen::arbitrary<bool>());
        auto const count = *rc::gen::inRange<std::size_t>(1, 50);
        auto const steps = *rc::gen::container<std::vector<Step>>(count, anyStep());
        for (auto const& step : steps) {
            all.take(step);
        }
        all.finish();
        batches += all.batches();
        bodies += all.bodies();
        losses += all.losses();
        lateBatches += all.lateBatches();
    };

    for (int hundred = 0; hundred < 3; ++hundred) {
        EXPECT_TRUE(rc::check(holds));
    }
    EXPECT_GT(batches, 100U);
    EXPECT_GT(bodies, 100U);
    EXPECT_GT(losses, 30U);
    EXPECT_GT(lateBatches, 3U);
}

} // namespace

} // namespace project::test

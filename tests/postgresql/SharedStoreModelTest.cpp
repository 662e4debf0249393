#include <array>
#include <string>
#include <utility>
#include <vector>

#include <rapidcheck.h>

#include "postgresql/FaultyProxy.hpp"
#include "postgresql/SharedProjectFixture.hpp"
#include "project/stores/JournalBackend.hpp"
#include "support/NightlyScale.hpp"
#include "support/TreeModel.hpp"

namespace project::postgresql {

namespace {

using stores::JournalBackend;
using stores::TreeMetadataManager;
using test::FaultyProxy;
using test::TreeModel;

constexpr std::size_t clients = 3;

/// A transaction of one client, during which its connection may break.
struct Step {
    std::size_t client = 0;
    std::vector<test::PartialWrite> writes{};
    bool isCommitted = true;
    std::size_t bytesBefore = 0; ///< the bytes until the connection breaks; 0 for a connection that holds
    FaultyProxy::Fault fault = FaultyProxy::Fault::Cut;
};

void showValue(Step const& step, std::ostream& out) {
    out << "by " << step.client;
    if (step.bytesBefore > 0) {
        out << (step.fault == FaultyProxy::Fault::Cut ? ", cut after " : ", half closed after ")
            << step.bytesBefore;
    }
    for (auto const& write : step.writes) {
        test::showValue(write, out);
    }
    out << (step.isCommitted ? "\n" : "\n  rolled back\n");
}

rc::Gen<Step> anyStep() {
    return rc::gen::build<Step>(
        rc::gen::set(&Step::client, rc::gen::inRange<std::size_t>(0, clients)),
        rc::gen::set(&Step::writes,
                     rc::gen::mapcat(rc::gen::inRange<std::size_t>(1, 4),
                                     [](std::size_t count) {
                                         return rc::gen::container<std::vector<test::PartialWrite>>(
                                             count, test::anyPartialWrite());
                                     })),
        rc::gen::set(&Step::isCommitted, rc::gen::weightedElement<bool>({{4, true}, {1, false}})),
        rc::gen::set(&Step::bytesBefore,
                     rc::gen::oneOf(rc::gen::just<std::size_t>(0), rc::gen::inRange<std::size_t>(1, 1500))),
        rc::gen::set(&Step::fault, rc::gen::element(FaultyProxy::Fault::Cut, FaultyProxy::Fault::HalfClose)));
}

/// A few clients of one project on a real server, each behind a proxy of its own.
class Clients {
public:
    explicit Clients(JournalBackend::Options const& options) : options_(options) {
        for (auto& client : clients_) {
            client.proxy = std::make_unique<FaultyProxy>(sharedServer().port());
            client.tree = open(client.proxy->port());
            test::requireEqual(*client.tree, model_); // a client that was never connected tries only once
        }
    }

    /// The journal repeats what was lost, so a break changes nothing.
    void take(Step const& step) {
        auto& client = clients_.at(step.client);
        if (step.bytesBefore > 0) {
            client.proxy->breakAfter(step.bytesBefore, step.fault);
        }
        TreeModel after = model_;
        test::runTransaction(*client.tree, step.writes, step.isCommitted, after);
        model_ = after;
        test::requireEqual(*client.tree, model_);
        test::requireEqual(*clients_.at((step.client + 1) % clients).tree, model_);
        breaks_ += client.proxy->hasBroken() && step.bytesBefore > 0 ? 1 : 0;
    }

    void finish() {
        for (auto& client : clients_) {
            test::requireEqual(*client.tree, model_);
        }
        test::requireEqual(*open(sharedServer().port()), model_);
    }

    std::size_t breaks() const { return breaks_; }

private:
    struct Client {
        std::unique_ptr<FaultyProxy> proxy;
        std::unique_ptr<TreeMetadataManager> tree;
    };

    std::unique_ptr<TreeMetadataManager> open(int port) const {
        auto journal = std::make_unique<PostgresJournal>(
            settingsFor(test::PostgresServer::connectionAt(port, "swift")), project_.id);
        return std::make_unique<TreeMetadataManager>(
            std::make_unique<JournalBackend>(std::move(journal), options_), u"/project/.projectdata");
    }

    JournalBackend::Options const options_;
    SharedProject const project_ = createProject(sharedServer());
    std::array<Client, clients> clients_;
    TreeModel model_;
    std::size_t breaks_ = 0;
};

} // namespace

TEST(SharedStoreModel, afterAnyHistoryOfSeveralClientsAProjectEqualsAPlainMap) {
    if (auto const obstacle = test::PostgresServer::obstacle(); !obstacle.empty()) {
        GTEST_SKIP() << obstacle;
    }
    std::size_t breaks = 0;
    EXPECT_TRUE(rc::check([&] {
        auto const shortTail = *rc::gen::element<std::size_t>(0, 400, 65'536);
        Clients all({.patience = std::chrono::seconds(30), .shortTail = shortTail});
        auto const count = *rc::gen::inRange<std::size_t>(1, 8);
        for (auto const& step : *rc::gen::container<std::vector<Step>>(count, anyStep())) {
            all.take(step);
        }
        all.finish();
        breaks += all.breaks();
    }));
    EXPECT_GT(breaks, 30U);
}

} // namespace project::postgresql

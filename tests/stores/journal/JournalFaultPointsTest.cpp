#include <functional>
#include <set>

#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using testing::IsEmpty;
using InjectedFault = JournalServer::InjectedFault;
using Server = std::shared_ptr<JournalServer>;

/// An operation of one client, and the content after it.
struct Operation {
    std::string name;
    JournalBackend::Options options;
    std::function<void(JournalBackend&)> run;
    std::function<Content(Content const&)> after;
};

/// The entries on the server before the operation.
struct History {
    std::string name;
    std::function<void(Server const&)> write;
    bool isRead;                              ///< the client that runs the operation has read it
    std::function<void(Server const&)> since; ///< written after that
};

Content same(Content const& before) {
    return before;
}

std::unique_ptr<JournalBackend> clientOf(Server const& server, JournalBackend::Options options) {
    return std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server), options);
}

JournalBackend::Options withTailOf(std::size_t bytes) {
    return {.patience = std::chrono::milliseconds(1), .shortTail = bytes, .bodyToTail = 1'000'000};
}

std::vector<Operation> operations() {
    auto const usual = withTailOf(1'000);
    auto const addX = [](JournalBackend& client) { commit(client, {set(fileAddress(u"x"))}); };
    auto const withX = [](Content before) {
        before.merge(files({u"x"}));
        return before;
    };
    return {
        {"read", usual, [](JournalBackend& client) { contentOf(client); }, same},
        {"write", usual, addX, withX},
        {"write a body", withTailOf(0), addX, withX},
        {"write a body with its batch", withTailOf(120), addX, withX},
        {"remove", usual, [](JournalBackend& client) { commit(client, {remove(fileAddress(u"a"))}); },
         [](Content before) {
             before.erase(fileAddress(u"a"));
             return before;
         }},
        {"tidy", usual, [](JournalBackend& client) { client.tidy(); }, same},
        {"replace", usual,
         [](JournalBackend& client) {
             client.replace(textOf(addFiles({u"a", u"r"})));
         },
         [](Content const&) {
             return files({u"a", u"r"});
         }},
        {"delete history", usual, [](JournalBackend& client) { client.deleteHistory(); }, same},
        {"check", usual, [](JournalBackend& client) { EXPECT_THAT(client.check(), IsEmpty()); }, same},
        {"status", usual, [](JournalBackend& client) { client.status(); }, same},
        {"text", usual, [](JournalBackend& client) { client.text(); }, same},
        {"repair", usual, [](JournalBackend& client) { client.repair(); }, same},
    };
}

std::vector<History> histories() {
    auto const none = [](Server const&) {};
    auto const body = [](Server const& server) {
        commit(*clientOf(server, withTailOf(1'000)), addFiles({u"a", u"b"}));
    };
    auto const tail = [](Server const& server) {
        auto const client = clientOf(server, withTailOf(1'000));
        commit(*client, {set(fileAddress(u"c"))});
        commit(*client, {remove(fileAddress(u"b"))});
    };
    auto const bodies = [](Server const& server) {
        commit(*clientOf(server, withTailOf(0)), {set(fileAddress(u"d"))});
        commit(*clientOf(server, withTailOf(1'000)), {set(fileAddress(u"e"))});
    };
    return {
        {"none", none, false, none},
        {"a body", body, false, none},
        {"a body that was read", body, true, none},
        {"a body and a tail", body, false, tail},
        {"a body that was read and a tail", body, true, tail},
        {"a body and another one", body, false, bodies},
        {"a body that was read and another one", body, true, bodies},
    };
}

/// One run of an operation with a fault at one call.
class FaultPoint {
public:
    FaultPoint(Operation const& operation, History const& history) : operation_(operation) {
        history.write(server_);
        client_ = clientOf(server_, operation.options);
        if (history.isRead) {
            contentOf(*client_);
        }
        history.since(server_);
        before_ = stored();
        after_ = operation.after(before_);
        contentOf(*witness_);
    }

    /// @return false if the operation has fewer calls.
    bool run(InjectedFault fault, std::size_t callsBefore, std::set<std::string>& met) {
        server_->calls.clear();
        server_->plan(fault, callsBefore);
        bool isDone = false;
        bool isOpen = false;
        try {
            operation_.run(*client_);
            isDone = true;
        } catch (StoreError const& error) {
            isOpen = error.kind() == StoreError::Kind::OutcomeUnknown;
        } catch (ProcessDied const&) {
            isOpen = true;
            client_.reset();
        }
        bool const isReached = !server_->cancelPlan();
        if (isReached) {
            met.insert(server_->calls.at(callsBefore));
        }
        verify(isDone, isOpen);
        return isReached;
    }

private:
    Content stored() const { return contentOf(*clientOf(server_, withTailOf(1'000))); }

    void verify(bool isDone, bool isOpen) {
        auto now = stored();
        if (isOpen) {
            EXPECT_TRUE(now == before_ || now == after_);
            stored(); // a late insert
            now = stored();
            EXPECT_TRUE(now == before_ || now == after_);
        } else {
            EXPECT_EQ(now, isDone ? after_ : before_);
        }
        if (!client_) {
            client_ = clientOf(server_, operation_.options);
        }
        EXPECT_EQ(contentOf(*client_), now);
        commit(*client_, {set(fileAddress(u"y"))});
        now.merge(files({u"y"}));
        EXPECT_EQ(stored(), now);
        EXPECT_EQ(contentOf(*witness_), now);
        EXPECT_THAT(client_->check(), IsEmpty());
        verifyLog();
    }

    void verifyLog() const {
        std::set<std::string> ids;
        stores::JournalEntry const* previous = nullptr;
        for (auto const& entry : server_->entries()) {
            EXPECT_TRUE(ids.insert(entry.read.position.id).second) << "an entry is stored twice";
            if (previous != nullptr) {
                EXPECT_EQ(entry.read.position.version, previous->position.version + 1);
                EXPECT_EQ(entry.read.after, previous->position.sum);
            }
            previous = &entry.read;
        }
    }

    Operation const& operation_;
    Server const server_ = std::make_shared<JournalServer>();
    std::unique_ptr<JournalBackend> client_;
    std::unique_ptr<JournalBackend> const witness_ = clientOf(server_, withTailOf(1'000));
    Content before_;
    Content after_;
};

TEST(JournalFaultPoints, afterAnyFaultAtAnyCallABatchIsStoredOnceOrNotAtAllAsTheResultSays) {
    std::size_t points = 0;
    auto const all = operations();
    auto const before = histories();
    for (auto const fault : {InjectedFault::LostBefore, InjectedFault::LostAfter, InjectedFault::Unreachable,
                             InjectedFault::Stalls, InjectedFault::StallsLate, InjectedFault::DiskFull,
                             InjectedFault::DiesBefore, InjectedFault::DiesAfter}) {
        std::set<std::string> met;
        for (auto const& operation : all) {
            for (auto const& history : before) {
                SCOPED_TRACE(operation.name + " after " + history.name + ", fault " +
                             std::to_string(static_cast<int>(fault)));
                std::size_t call = 0;
                while (FaultPoint(operation, history).run(fault, call, met)) {
                    ++call;
                }
                points += call;
                EXPECT_GT(call, 0U);
            }
        }
        EXPECT_THAT(met,
                    testing::IsSupersetOf({"look", "lock", "pieces", "insert", "body", "records", "delete"}));
    }
    EXPECT_GT(points, 1'000U);
}

} // namespace

} // namespace project::test

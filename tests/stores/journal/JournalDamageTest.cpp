#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// Entries that are not what a client has written.
class JournalDamage : public JournalStore {
protected:
    void SetUp() override {
        prepare({u"a"});
        for (auto const* const path : {u"b", u"c", u"d"}) {
            commit(*healthy_, {set(fileAddress(path))});
        }
    }

    static void corrupt(std::string& bytes) { bytes[bytes.size() / 2] ^= 1; }

    /// A client that opens the project now shows these files, names the version and writes nothing.
    void expectDamage(std::uint64_t version, std::vector<std::u16string> const& readable) const {
        auto const client = open();
        EXPECT_EQ(contentOf(*client), files(readable));
        auto const entries = server->entries().size();
        auto const error = errorOf([&] { commit(*client, {set(fileAddress(u"x"))}); });
        EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
        EXPECT_THAT(error.problem(), HasSubstr("version " + std::to_string(version) + " is damaged"));
        EXPECT_THAT(error.remedy(), HasSubstr("check --repair"));
        EXPECT_EQ(errorOf([&] { client->text(); }).kind(), StoreError::Kind::Damaged);
        EXPECT_EQ(errorOf([&] { client->tidy(); }).kind(), StoreError::Kind::Damaged);
        EXPECT_EQ(server->entries().size(), entries);
        auto const faults = client->check();
        ASSERT_EQ(faults.size(), 1U);
        EXPECT_EQ(faults[0].kind, stores::Fault::Kind::Damage);
        EXPECT_THAT(faults[0].problem, HasSubstr("version " + std::to_string(version) + " is damaged"));
    }

    std::unique_ptr<JournalBackend> const healthy_ = open();
};

TEST_F(JournalDamage, aSoundLogHasNoFaultsAndNothingToRepair) {
    EXPECT_THAT(open()->check(), IsEmpty());
    EXPECT_FALSE(open()->repair());
    EXPECT_EQ(server->entries().size(), 4U);
}

TEST_F(JournalDamage, aBatchWithAChangedByteIsDamageAndTheEntriesBeforeItAreReadable) {
    std::string const& lines = server->entry(3).read.lines;
    for (std::size_t position = 0; position < lines.size(); ++position) {
        server->entry(3).read.lines[position] ^= 1;
        auto const client = open();
        EXPECT_EQ(contentOf(*client), files({u"a", u"b"})) << "byte " << position;
        EXPECT_EQ(client->check().size(), 1U) << "byte " << position;
        server->entry(3).read.lines[position] ^= 1;
    }
    corrupt(server->entry(3).read.lines);
    expectDamage(3, {u"a", u"b"});
}

TEST_F(JournalDamage, aBatchThatIsCutOffOrEmptyOrTwiceInOneEntryIsDamage) {
    std::string const lines = server->entry(3).read.lines;
    for (auto const& wrong : {std::string(), lines.substr(0, lines.size() - 1),
                              lines.substr(lines.find('\n') + 1), lines + lines, "\n" + lines}) {
        server->entry(3).read.lines = wrong;
        expectDamage(3, {u"a", u"b"});
    }
}

TEST_F(JournalDamage, anEntryThatDoesNotFollowTheOneBeforeItIsDamage) {
    server->entry(3).read.after = std::string(32, '0');
    expectDamage(3, {u"a", u"b"});
}

TEST_F(JournalDamage, anEntryWithAnotherChecksumThanItsLinesIsDamage) {
    server->entry(3).read.position.sum = std::string(32, '0');
    expectDamage(3, {u"a", u"b"});
}

TEST_F(JournalDamage, aMissingEntryIsDamage) {
    auto& entries = server->entries();
    entries.erase(entries.begin() + 2);
    expectDamage(4, {u"a", u"b"});
}

TEST_F(JournalDamage, aDamagedBodyIsReplacedByTheEntriesBeforeItIfTheyContainTheSame) {
    healthy_->tidy();
    auto const id = server->entry(5).read.position.id;
    for (int turn = 0; turn < 2; ++turn) {
        EXPECT_EQ(stored(), files({u"a", u"b", u"c", u"d"}));
        EXPECT_THAT(open()->check(), IsEmpty());
        if (turn == 0) {
            corrupt(server->pieces().at(id));
        } else {
            server->pieces().erase(id);
        }
    }
}

TEST_F(JournalDamage, aDamagedBodyThatContainsMoreThanTheEntriesBeforeItIsDamage) {
    commit(*open(ofBodies()), {set(fileAddress(u"e"))});
    commit(*open(), {set(fileAddress(u"f"))});
    corrupt(server->pieces().at(server->entry(5).read.position.id));
    expectDamage(5, {u"a", u"b", u"c", u"d"});
    server->pieces().erase(server->entry(5).read.position.id);
    expectDamage(5, {u"a", u"b", u"c", u"d"});
}

TEST_F(JournalDamage, eachDamagedByteOfABodyIsNoticed) {
    auto& bytes = server->pieces().at(server->entry(1).read.position.id);
    for (std::size_t position = 0; position < bytes.size(); ++position) {
        bytes[position] ^= 1;
        auto const error = errorOf([&] { contentOf(*open()); });
        EXPECT_EQ(error.kind(), StoreError::Kind::Damaged) << "byte " << position;
        EXPECT_THAT(error.problem(), HasSubstr("version 1 is damaged")) << "byte " << position;
        bytes[position] ^= 1;
    }
}

TEST_F(JournalDamage, aBodyWithOtherLineEndsIsDamageAlthoughChecksumsDoNotCoverThem) {
    std::string const bytes = server->pieces().at(server->entry(1).read.position.id);
    auto const firstEnd = bytes.find('\n');
    for (auto const& wrong : {bytes.substr(0, firstEnd) + bytes.substr(firstEnd + 1),
                              bytes.substr(0, firstEnd) + "\r" + bytes.substr(firstEnd)}) {
        ASSERT_EQ(stores::samples::sumOf(bytes.substr(0, firstEnd + 1)),
                  stores::samples::sumOf(bytes.substr(0, firstEnd) + "\r\n"));
        server->pieces().at(server->entry(1).read.position.id) = wrong;
        EXPECT_EQ(errorOf([&] { contentOf(*open()); }).kind(), StoreError::Kind::Damaged);
    }
}

TEST_F(JournalDamage, anEntryWithAnotherNumberIsDamage) {
    server->entry(4).read.position.version = 5;
    expectDamage(5, {u"a", u"b", u"c"});
}

/// An entry with a body and a batch that contradict each other.
class JournalContradiction : public JournalDamage {
protected:
    void SetUp() override {
        JournalDamage::SetUp();
        contentOf(*reader_);
        commit(*open({.shortTail = 150}), {set(fileAddress(u"e"))});
        auto& entry = server->entry(5);
        ASSERT_TRUE(entry.read.isBody);
        ASSERT_FALSE(entry.read.lines.empty());
        auto const other = textOf(addFiles({u"a", u"b", u"c", u"x"}));
        entry.read.position.sum = stores::samples::sumOf(other);
        server->pieces().at(entry.read.position.id) = other;
    }

    std::unique_ptr<JournalBackend> const reader_ = open();
};

TEST_F(JournalContradiction, isReadAsTheBody) {
    Entered const guard(*reader_);
    EXPECT_THAT(addressesOf(guard.changes().differences), ElementsAre(fileAddress(u"d"), fileAddress(u"x")));
    EXPECT_EQ(loadAll(*reader_), files({u"a", u"b", u"c", u"x"}));
}

TEST_F(JournalContradiction, isDamageIfTheBodyIsMissing) {
    server->pieces().erase(server->entry(5).read.position.id);
    Entered const guard(*reader_);
    EXPECT_THAT(guard.changes().differences, IsEmpty());
    EXPECT_EQ(loadAll(*reader_), files({u"a", u"b", u"c", u"d"}));
    expectDamage(5, {u"a", u"b", u"c", u"d"});
}

TEST_F(JournalDamage, aLogWithoutABodyIsDamage) {
    server->entries().pop_front();
    auto const error = errorOf([&] { contentOf(*open()); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
    EXPECT_THAT(error.problem(), HasSubstr("version 2 is damaged: no body precedes it"));
}

TEST_F(JournalDamage, aLaterBodyEndsTheDamage) {
    auto const client = open();
    contentOf(*client);
    healthy_->tidy();
    commit(*healthy_, {set(fileAddress(u"e"))});
    corrupt(server->entry(3).read.lines);

    EXPECT_EQ(stored(), files({u"a", u"b", u"c", u"d", u"e"}));
    EXPECT_EQ(contentOf(*client), stored());
    EXPECT_THAT(client->check(), IsEmpty());
}

TEST_F(JournalDamage, aClientThatSeesTheDamageReportsTheDifferencesWhenItIsRepaired) {
    corrupt(server->entry(3).read.lines);
    auto const client = open();
    contentOf(*client);
    EXPECT_TRUE(healthy_->repair());

    Entered const guard(*client);

    EXPECT_THAT(addressesOf(guard.changes().differences), ElementsAre(fileAddress(u"c"), fileAddress(u"d")));
    EXPECT_EQ(loadAll(*client), files({u"a", u"b", u"c", u"d"}));
    EXPECT_FALSE(client->takeHistoryLoss());
}

TEST_F(JournalDamage, aClientThatReadTheEntriesBeforeTheyWereDamagedRepairsThemWithoutLoss) {
    corrupt(server->entry(3).read.lines);

    auto const aside = healthy_->repair();

    ASSERT_TRUE(aside);
    EXPECT_EQ(aside->first, 3U);
    EXPECT_EQ(aside->last, 4U);
    EXPECT_TRUE(aside->isNothingLost);
    EXPECT_EQ(stored(), files({u"a", u"b", u"c", u"d"}));
    EXPECT_FALSE(healthy_->repair());
}

TEST_F(JournalDamage, aClientThatReadSomeOfTheEntriesBeforeTheyWereDamagedLosesOnlyTheOthers) {
    commit(*open(), {set(fileAddress(u"e"))});
    corrupt(server->entry(2).read.lines);
    corrupt(server->entry(5).read.lines);

    auto const aside = healthy_->repair();

    ASSERT_TRUE(aside);
    EXPECT_EQ(aside->first, 2U);
    EXPECT_EQ(aside->last, 5U);
    EXPECT_FALSE(aside->isNothingLost);
    EXPECT_EQ(stored(), files({u"a", u"b", u"c", u"d"}));
    EXPECT_EQ(contentOf(*healthy_), stored());
}

TEST_F(JournalDamage, onlyTheOwnerSetsEntriesAside) {
    corrupt(server->entry(3).read.lines);
    JournalBackend client(std::make_unique<MemoryJournal>(server, "anna"), appending());
    contentOf(client);

    EXPECT_EQ(errorOf([&] { client.repair(); }).kind(), StoreError::Kind::Refused);

    EXPECT_EQ(stored(), files({u"a", u"b"})) << "the damage stays";
    EXPECT_TRUE(open()->repair());
}

TEST_F(JournalDamage, anyOtherClientSetsTheDamagedEntriesAsideAndTheyStayInTheLog) {
    corrupt(server->entry(3).read.lines);
    auto const client = open();
    contentOf(*client);

    auto const aside = client->repair();

    ASSERT_TRUE(aside);
    EXPECT_EQ(aside->first, 3U);
    EXPECT_EQ(aside->last, 4U);
    EXPECT_FALSE(aside->isNothingLost);
    EXPECT_EQ(server->entries().size(), 5U);
    EXPECT_EQ(stored(), files({u"a", u"b"}));
    EXPECT_THAT(client->check(), IsEmpty());
    commit(*client, {set(fileAddress(u"e"))});
    EXPECT_EQ(stored(), files({u"a", u"b", u"e"}));
    Entered const guard(*healthy_);
    EXPECT_EQ(loadAll(*healthy_), files({u"a", u"b", u"e"}));
    EXPECT_FALSE(healthy_->takeHistoryLoss());
}

TEST_F(JournalDamage, ifNothingIsReadableOnlyACopyRestoresTheProject) {
    server->pieces().clear();
    auto const client = open();
    EXPECT_EQ(errorOf([&] { contentOf(*client); }).kind(), StoreError::Kind::Damaged);
    auto const error = errorOf([&] { client->repair(); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
    EXPECT_THAT(error.problem(), HasSubstr("nothing before it is readable"));

    client->replace(textOf(addFiles({u"a", u"z"})));

    EXPECT_EQ(stored(), files({u"a", u"z"}));
    EXPECT_EQ(contentOf(*client), stored());
    commit(*client, {set(fileAddress(u"y"))});
    EXPECT_EQ(stored(), files({u"a", u"y", u"z"}));
}

} // namespace

} // namespace project::test

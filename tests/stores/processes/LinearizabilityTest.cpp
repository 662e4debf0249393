#include "support/Linearizability.hpp"

#include <gtest/gtest.h>

namespace project::test {

namespace {

using Kind = Operation::Kind;

constexpr std::uint16_t a = 1;
constexpr std::uint16_t ax = 2;
constexpr std::uint16_t b = 8;

/// Processes 0 to 7 on a store that is initially empty.
class LinearizabilityCheck : public testing::Test {
protected:
    static Operation set(std::uint16_t mask, std::uint32_t value) {
        return {.kind = Kind::Set, .mask = mask, .value = value};
    }

    static Operation remove(std::uint16_t mask) { return {.kind = Kind::Remove, .mask = mask}; }

    static Operation create(std::uint16_t mask) { return {.kind = Kind::Create, .mask = mask}; }

    /// A read that finds these values at a, a/x and b, and nothing elsewhere.
    static Operation read(std::uint32_t atA, std::uint32_t atAx, std::uint32_t atB) {
        return {.kind = Kind::Read, .hasSeen = true, .seen = {{atA, atAx, 0, atB}}};
    }

    static Operation readAndSet(std::uint32_t atA, std::uint16_t mask, std::uint32_t value) {
        return {.kind = Kind::Set, .hasSeen = true, .mask = mask, .value = value, .seen = {{atA}}};
    }

    /// One operation after another.
    bool does(std::size_t process, Operation const& operation) {
        order.begin(process, operation);
        return order.end(process);
    }

    Linearizability order{Slots{}};
};

TEST_F(LinearizabilityCheck, oneProcessIsLinearizable) {
    EXPECT_TRUE(does(0, read(0, 0, 0)));
    EXPECT_TRUE(does(0, set(a | b, 7)));
    EXPECT_TRUE(does(0, read(7, 0, 7)));
    EXPECT_TRUE(does(0, set(ax, 8)));
    EXPECT_TRUE(does(0, remove(a)));
    EXPECT_TRUE(does(0, read(0, 0, 7)));
    EXPECT_TRUE(does(0, create(a | b)));
    EXPECT_TRUE(does(0, read(Slots::created, 0, 7)));
    EXPECT_EQ(1U, order.countPossible());
}

TEST_F(LinearizabilityCheck, anAddressWithoutValuesBelowExistsOnlyIfItWasCreated) {
    EXPECT_TRUE(does(0, set(ax, 7)));
    EXPECT_TRUE(does(0, read(Slots::created, 7, 0)));
    EXPECT_TRUE(does(0, create(a)));
    EXPECT_TRUE(does(0, remove(ax)));
    EXPECT_TRUE(does(0, read(0, 0, 0)));
}

TEST_F(LinearizabilityCheck, concurrentWritesMayTakeEffectInAnyOrder) {
    order.begin(0, set(a, 7));
    order.begin(1, set(a, 8));
    order.begin(2, read(8, 0, 0));
    order.begin(3, read(7, 0, 0));
    EXPECT_TRUE(order.end(0));
    EXPECT_TRUE(order.end(2));
    EXPECT_TRUE(order.end(3));
    EXPECT_TRUE(order.end(1));
}

TEST_F(LinearizabilityCheck, aReadMayOrMayNotShowAnUnfinishedWrite) {
    order.begin(0, set(a, 7));
    EXPECT_TRUE(does(1, read(0, 0, 0)));
    EXPECT_TRUE(does(1, read(7, 0, 0)));
    EXPECT_TRUE(order.end(0));
}

TEST_F(LinearizabilityCheck, aLostUpdateIsNotLinearizable) {
    order.begin(0, readAndSet(0, a, 7));
    order.begin(1, readAndSet(0, a, 8)); // it did not see the first write, and overwrote it
    bool const first = order.end(0);
    EXPECT_FALSE(order.end(1) && first);
}

TEST_F(LinearizabilityCheck, aLostWriteIsNotLinearizable) {
    EXPECT_TRUE(does(0, set(a, 7)));
    EXPECT_TRUE(does(1, set(b, 8)));
    EXPECT_FALSE(does(2, read(0, 0, 8)));
}

TEST_F(LinearizabilityCheck, aReadOlderThanAnEndedWriteIsNotLinearizable) {
    EXPECT_TRUE(does(0, set(a, 7)));
    EXPECT_FALSE(does(1, read(0, 0, 0)));
}

TEST_F(LinearizabilityCheck, aReadOfAValueBeforeItsWriteIsNotLinearizable) {
    EXPECT_FALSE(does(1, read(7, 0, 0)));
}

TEST_F(LinearizabilityCheck, aReadOfHalfABatchIsNotLinearizable) {
    order.begin(0, set(a | b, 7));
    EXPECT_FALSE(does(1, read(7, 0, 0)));
}

TEST_F(LinearizabilityCheck, aProcessThatGoesBackInTimeIsNotLinearizable) {
    order.begin(0, set(a, 7));
    EXPECT_TRUE(does(1, read(7, 0, 0)));
    EXPECT_FALSE(does(1, read(0, 0, 0)));
}

TEST_F(LinearizabilityCheck, twoReadersThatSawWritesInDifferentOrdersAreNotLinearizable) {
    order.begin(0, set(a, 7));
    order.begin(1, set(b, 8));
    order.begin(2, read(7, 0, 0));
    order.begin(3, read(0, 0, 8));
    bool const first = order.end(2);
    EXPECT_FALSE(order.end(3) && first);
}

TEST_F(LinearizabilityCheck, aRemovalThatKeepsValuesBelowIsNotLinearizable) {
    EXPECT_TRUE(does(0, set(a | ax, 7)));
    EXPECT_TRUE(does(0, remove(a)));
    EXPECT_FALSE(does(1, read(0, 7, 0)));
}

TEST_F(LinearizabilityCheck, theWriteOfADeadProcessTookEffectOrNot) {
    for (std::uint32_t const seen : {0U, 7U}) {
        order = Linearizability(Slots{});
        order.begin(0, set(a | b, 7));
        order.die(0);
        EXPECT_EQ(2U, order.countPossible());
        EXPECT_TRUE(does(1, read(seen, 0, seen)));
        EXPECT_FALSE(does(2, read(7 - seen, 0, 7 - seen))) << "it can no longer take effect or be undone";
    }
}

TEST_F(LinearizabilityCheck, theWriteOfADeadProcessNeverTakesEffectPartially) {
    order.begin(0, set(a | b, 7));
    order.die(0);
    EXPECT_FALSE(does(1, read(0, 0, 7)));
}

} // namespace

} // namespace project::test

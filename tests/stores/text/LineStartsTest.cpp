#include "text/LineStarts.hpp"

#include <gtest/gtest.h>

namespace project::stores {
namespace {

TEST(LineStarts, positionsBeyondFourGigabytesAreStored) {
    std::vector<std::size_t> const positions{0,           5,           0xFFFFFFFF,   0x100000000,
                                             0x100000001, 0x1FFFFFFFF, 0x0500000000, 0x0500000007};
    LineStarts starts;
    for (auto const position : positions) {
        starts.add(position);
    }
    ASSERT_EQ(starts.size(), positions.size());
    for (std::size_t line = 0; line < positions.size(); ++line) {
        EXPECT_EQ(starts[line], positions[line]);
    }
}

} // namespace
} // namespace project::stores

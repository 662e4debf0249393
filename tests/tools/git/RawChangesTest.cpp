#include "git/RawChanges.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace project::test {
namespace {

using namespace std::string_literals;
using projectctl::RawChange;
using projectctl::readRawChanges;

std::string described(RawChange const& change) {
    return change.status + std::to_string(change.similarity) + ' ' + change.before + ".." + change.after +
           ' ' + change.from + " -> " + change.to;
}

std::vector<std::string> described(std::vector<RawChange> const& changes) {
    std::vector<std::string> result;
    for (auto const& change : changes) {
        result.push_back(described(change));
    }
    return result;
}

TEST(RawChanges, areReadWithBothPathsOfARename) {
    EXPECT_THAT(described(readRawChanges(":100644 100755 aa bb M\0a file\0"
                                         ":100644 100644 cc dd R087\0src/old\nname\0lib/new\0"
                                         ":000000 100644 00 ee A\0new\0"s)),
                ::testing::ElementsAre("M0 aa..bb a file -> a file", "R87 cc..dd src/old\nname -> lib/new",
                                       "A0 00..ee new -> new"));
}

TEST(RawChanges, endBeforeAnythingElse) {
    EXPECT_THAT(readRawChanges(""), ::testing::IsEmpty());
    EXPECT_THAT(readRawChanges("commit"), ::testing::IsEmpty());
    EXPECT_EQ(readRawChanges(":100644 100644 aa bb D\0a\0:100644 100644 cc dd R100\0b\0"s).size(), 1U);
    EXPECT_EQ(readRawChanges(":100644 100644 aa bb D\0a\0:100644 cc D\0b\0"s).size(), 1U);
}

} // namespace
} // namespace project::test

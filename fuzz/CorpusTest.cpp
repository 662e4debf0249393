#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <ostream>
#include <string>

#include <gtest/gtest.h>

#include "Target.hpp"

namespace project::fuzz {

/// For the names of tests: gtest would print the addresses of the members.
void PrintTo(Target const& target, std::ostream* stream) {
    *stream << target.name;
}

namespace {

std::string contentOf(std::filesystem::path const& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

class Corpus : public testing::TestWithParam<Target> {};

TEST_P(Corpus, holds) {
    std::size_t count = 0;
    for (auto const& entry :
         std::filesystem::directory_iterator(PROJECT_CORPORA "/" + std::string(GetParam().name))) {
        SCOPED_TRACE(entry.path().filename());
        EXPECT_NO_THROW(GetParam().run(contentOf(entry.path())));
        ++count;
    }
    EXPECT_GT(count, 0U);
}

INSTANTIATE_TEST_SUITE_P(Of, Corpus, testing::ValuesIn(targets()),
                         [](auto const& target) { return std::string(target.param.name); });

TEST(Corpora, belongToTargets) {
    for (auto const& entry : std::filesystem::directory_iterator(PROJECT_CORPORA)) {
        bool const hasTarget = std::ranges::any_of(
            targets(), [&](Target const& target) { return entry.path().filename() == target.name; });
        EXPECT_TRUE(hasTarget || !entry.is_directory()) << entry.path();
    }
}

TEST(Corpora, areCheckedByLawsThatCanBreak) {
    EXPECT_NO_THROW(require(true, "this holds"));
    EXPECT_THROW(require(false, "this holds"), BrokenLaw);
}

} // namespace
} // namespace project::fuzz

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include <gtest/gtest.h>

#include "Target.hpp"

namespace project::fuzz {
namespace {

std::string contentOf(std::filesystem::path const& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

void runAll(std::string const& name) {
    auto const& all = targets();
    auto const target =
        std::find_if(all.begin(), all.end(), [&](Target const& candidate) { return candidate.name == name; });
    ASSERT_NE(target, all.end());
    std::size_t count = 0;
    for (auto const& entry : std::filesystem::directory_iterator(PROJECT_CORPORA "/" + name)) {
        SCOPED_TRACE(entry.path().filename());
        EXPECT_NO_THROW(target->run(contentOf(entry.path())));
        ++count;
    }
    EXPECT_GT(count, 0U);
}

TEST(Corpus, ofTextsHolds) {
    runAll("text");
}

TEST(Corpus, ofTailsHolds) {
    runAll("tail");
}

TEST(Corpus, ofTextsWithMarkersHolds) {
    runAll("conflict");
}

TEST(Corpus, ofLinesHolds) {
    runAll("line");
}

TEST(Corpus, ofMergesHolds) {
    runAll("merge");
}

TEST(Corpus, ofPathsHolds) {
    runAll("path");
}

TEST(Corpus, ofGitsPatternsHolds) {
    runAll("pattern");
}

TEST(Corpus, isThereForEveryTarget) {
    for (Target const& target : targets()) {
        EXPECT_TRUE(std::filesystem::is_directory(PROJECT_CORPORA "/" + std::string(target.name)))
            << target.name;
    }
}

TEST(Corpus, aLawThatDoesNotHoldIsTold) {
    EXPECT_NO_THROW(require(true, "this holds"));
    EXPECT_THROW(require(false, "this holds"), BrokenLaw);
}

} // namespace
} // namespace project::fuzz

#include "states/SimilarContents.hpp"

#include <filesystem>
#include <random>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "git/GitRepository.hpp"

namespace project::git {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::vector<SimilarContent> compare(std::string const& before, std::string const& after, int similarity) {
    SimilarContents contents;
    contents.addBefore(before);
    std::vector<SimilarContent> result;
    contents.compare(0, after, similarity, result);
    return result;
}

TEST(SimilarContents, countsTheBytesOfLinesThatBothHaveOfThoseOfTheLargerOne) {
    EXPECT_THAT(compare("a\nbb\nccc\n", "ccc\na\nd\n", 1), ElementsAre(SimilarContent{0, 0, 6666}));
    EXPECT_THAT(compare("a\nbb\nccc\n", "ccc\na\nd\n", 67), IsEmpty());
}

TEST(SimilarContents, countsEqualLinesAsOftenAsBothHaveThem) {
    EXPECT_THAT(compare("a\na\n", "a\na\na\na\n", 1), ElementsAre(SimilarContent{0, 0, 5000}));
}

TEST(SimilarContents, ignoresCarriageReturnsInText) {
    EXPECT_THAT(compare("a\nb\n", "a\r\nb\r\n", 1), ElementsAre(SimilarContent{0, 0, 6666}));
    EXPECT_THAT(compare(std::string("a\nb\n\0", 5), std::string("a\r\nb\r\n\0", 7), 20), IsEmpty());
}

TEST(SimilarContents, ofAnEmptyContentAreNone) {
    EXPECT_THAT(compare("", "", 1), IsEmpty());
    EXPECT_THAT(compare("", "a\n", 1), IsEmpty());
}

TEST(SimilarContents, areFoundAmongAllEarlierOnes) {
    SimilarContents contents;
    contents.addBefore("a\nb\n");
    contents.addBefore("unlike\n");
    contents.addBefore("b\nc\n");
    std::vector<SimilarContent> found;

    contents.compare(7, "a\nb\n", 50, found);
    contents.compare(8, "c\nd\n", 50, found);

    EXPECT_THAT(found, ElementsAre(SimilarContent{0, 7, 10000}, SimilarContent{2, 7, 5000},
                                   SimilarContent{2, 8, 5000}));
}

/// The same percentages as git's, for random edits of texts and of binary files.
class SimilarContentsInRepository : public GitTest {
protected:
    std::string line(bool isBinary) {
        std::string result(std::uniform_int_distribution<std::size_t>(1, 150)(random_), 'x');
        for (auto& character : result) {
            character =
                static_cast<char>(std::uniform_int_distribution<int>(isBinary ? 0 : 32, 126)(random_));
        }
        return result + (std::bernoulli_distribution(0.2)(random_) ? "\r\n" : "\n");
    }

    std::mt19937 random_{7};
};

TEST_F(SimilarContentsInRepository, haveTheSimilarityThatGitFinds) {
    for (int round = 0; round < 20; ++round) {
        bool const isBinary = round % 4 == 0;
        std::string before;
        std::string after;
        for (int count = 0; count < 30; ++count) {
            auto const text = line(isBinary);
            before += text;
            after += count % 10 < round % 5 ? line(isBinary) : text;
        }
        after += "the end";
        repository.write("before", before);
        repository.commitAll();
        std::filesystem::remove(repository.onDisk() / "before");
        repository.write("after", after);
        repository.run({"add", "--all"});
        auto const records = recordsOf(repository.run({"diff", "--cached", "-M1%", "--raw", "-z"}));
        repository.run({"commit", "-q", "-m", "after"});
        std::filesystem::remove(repository.onDisk() / "after");
        auto const status = records.front().substr(records.front().rfind(' ') + 1); // "R085"

        auto const found = compare(before, after, 1);

        ASSERT_EQ(found.size(), 1U) << round;
        EXPECT_EQ(found.front().hundredths / 100, std::stoi(status.substr(1))) << round;
    }
}

} // namespace
} // namespace project::git

#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "git/GitRepository.hpp"

namespace project::git {
namespace {

/// The earlier contents of files, by `git rev-parse`.
class EarlierContents : public GitTest {
protected:
    /// The content of a file, as git knows it; empty if there is none.
    std::string contentOf(std::string const& name) {
        auto const found = adapter.earlierContents({repository.path(name)}, repository.path("list"));
        std::string result;
        for (auto const& [file, id] : found) {
            for (char const character : id) {
                auto const byte = static_cast<unsigned char>(character);
                result += "0123456789abcdef"[byte >> 4U];
                result += "0123456789abcdef"[byte & 15U];
            }
        }
        return result;
    }

    std::string known(std::string const& name) const {
        auto const line = repository.run({"rev-parse", name});
        return line.substr(0, line.size() - 1);
    }

    void commit(std::string const& name, std::string const& content) {
        repository.write(name, content);
        repository.commitAll();
    }
};

TEST_F(EarlierContents, areThoseOfTheLastCommitThatWroteTheList) {
    repository.write("list", "first\n");
    commit("file", "first\n");
    repository.write("list", "second\n");
    commit("file", "second\n");
    commit("file", "third\n");

    EXPECT_EQ(contentOf("file"), known("HEAD~1:file"));
}

TEST_F(EarlierContents, ofAMergeAreThoseOfTheSideThatWroteTheList) {
    commit("list", "first\n");
    repository.run({"checkout", "-q", "-b", "other"});
    repository.write("list", "second\n");
    commit("file", "of the other\n");
    auto const expected = known("HEAD:file");
    repository.run({"checkout", "-q", "-"});
    commit("elsewhere", "1\n");
    repository.run({"merge", "-q", "--no-edit", "other"});
    commit("file", "later\n");

    EXPECT_EQ(contentOf("file"), expected);
}

TEST_F(EarlierContents, areOtherwiseStagedOrCommittedOrDeletedOnes) {
    commit("deleted", "1\n");
    auto const deleted = known("HEAD:deleted");
    repository.run({"rm", "-q", "deleted"});
    commit("list", "first\n");
    commit("committed", "2\n");
    repository.run({"rm", "-q", "--cached", "committed"});
    repository.write("staged", "3\n");
    repository.run({"add", "staged"});

    EXPECT_EQ(contentOf("deleted"), deleted);
    EXPECT_EQ(contentOf("committed"), known("HEAD:committed"));
    EXPECT_EQ(contentOf("staged"), known(":staged"));
    EXPECT_EQ(contentOf("nowhere"), "");
}

TEST_F(EarlierContents, ofADeletedFileAreFoundOnTheSideOfAMergeThatDeletedIt) {
    commit("deleted", "1\n");
    repository.run({"checkout", "-q", "-b", "other"});
    repository.run({"rm", "-q", "deleted"});
    commit("list", "first\n");
    repository.run({"checkout", "-q", "-"});
    commit("elsewhere", "1\n");
    auto const deleted = known("HEAD:deleted");
    repository.run({"merge", "-q", "--no-edit", "other"});

    EXPECT_EQ(contentOf("deleted"), deleted);
}

TEST_F(EarlierContents, areNoneBeforeTheFirstCommit) {
    repository.write("file", "1\n");

    EXPECT_EQ(contentOf("file"), "");
}

} // namespace
} // namespace project::git

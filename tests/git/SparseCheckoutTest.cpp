#include "git/RepositoriesFixture.hpp"
#include "project/git/GitError.hpp"

namespace project::git {
namespace {

class SparseCheckout : public RepositoriesTest {
protected:
    GitRepository sparse() const {
        auto repository = committed("work");
        repository.write("out/a");
        repository.write("out/b");
        repository.commitAll();
        repository.run({"sparse-checkout", "set", "d"});
        return repository;
    }
};

TEST_F(SparseCheckout, aFileThatIsLeftOutIsUnmodified) {
    auto const repository = sparse();
    ASSERT_FALSE(std::filesystem::exists(repository.onDisk() / "out"));
    GitAdapter adapter(repository.root());
    expectAgreement(repository, adapter);
    EXPECT_EQ(repository.adapterStates(adapter, {"out/a", "out"}), (States{{"out/a", 1}, {"out", 1}}));
}

TEST_F(SparseCheckout, aFileOutsideTheConeThatExistsIsCompared) {
    auto const repository = sparse();
    GitAdapter adapter(repository.root());
    repository.write("out/a", "other\n");
    EXPECT_EQ(repository.adapterStates(adapter, {"out/a", "out/b"}), (States{{"out/a", 3}, {"out/b", 1}}));
    expectStates(repository, adapter);
}

TEST_F(SparseCheckout, aFileOutsideTheConeIsStagedAndCountsAsCheckedOut) {
    auto const repository = sparse();
    GitAdapter adapter(repository.root());
    repository.write("out/a", "other\n");
    repository.write("out/new");
    adapter.addToSourceControl(repository.paths({"out/a", "out/new"}));
    auto const tags = recordsOf(repository.run({"ls-files", "-t", "-z"}));
    EXPECT_EQ(tags, (std::vector<std::string>{"H d/kept", "H kept", "H out/a", "S out/b", "H out/new"}));
    expectStates(repository, adapter);
}

TEST_F(SparseCheckout, aFileThatIsLeftOutCanBeRemovedAndTheOthersStayLeftOut) {
    auto const repository = sparse();
    GitAdapter adapter(repository.root());
    adapter.removeFromSourceControl(repository.paths({"out/a"}));
    auto const tags = recordsOf(repository.run({"ls-files", "-t", "-z"}));
    EXPECT_EQ(tags, (std::vector<std::string>{"H d/kept", "H kept", "S out/b"}));
    expectStates(repository, adapter);
}

TEST_F(SparseCheckout, aSparseIndexIsAnErrorWithARemedy) {
    auto const repository = sparse();
    repository.run({"sparse-checkout", "reapply", "--sparse-index"});
    GitAdapter adapter(repository.root());
    try {
        repository.adapterStates(adapter, {"kept"});
        FAIL() << "it was read";
    } catch (GitError const& error) {
        EXPECT_NE(error.remedy().find("git sparse-checkout reapply --no-sparse-index"), std::string::npos);
    }
    repository.run({"sparse-checkout", "reapply", "--no-sparse-index"});
    expectStates(repository, adapter);
}

} // namespace
} // namespace project::git

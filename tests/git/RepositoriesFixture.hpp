#pragma once

#include "git/GitRepository.hpp"

namespace project::git {

/// Repositories that git created, and a comparison of their states with git's.
class RepositoriesTest : public ::testing::Test {
protected:
    /// A repository with a committed file "kept" and its folder "d" with "d/kept".
    GitRepository committed(std::string const& name) const {
        auto repository = GitRepository::init(folder.addFolder(name));
        repository.write("kept");
        repository.write("d/kept");
        repository.commitAll();
        return repository;
    }

    /// The states of all files must agree with git's, also after a file was staged and one was removed.
    static void expectAgreement(GitRepository const& repository, GitAdapter& adapter,
                                std::string const& removed = "kept") {
        repository.write(".gitignore", "*.o\n");
        repository.write("d/new");
        repository.write("x.o");
        expectStates(repository, adapter);
        adapter.addToSourceControl({repository.path("d/new")});
        adapter.removeFromSourceControl({repository.path(removed)});
        expectStates(repository, adapter);
        EXPECT_EQ(repository.statusStates().at("d/new"), 5);
        EXPECT_EQ(repository.statusStates().at(removed), 6);
        EXPECT_TRUE(std::filesystem::exists(repository.onDisk() / removed));
    }

    static void expectStates(GitRepository const& repository, GitAdapter& adapter) {
        auto const expected = repository.statusStates();
        std::vector<std::string> names;
        for (auto const& [name, state] : expected) {
            names.push_back(name);
        }
        EXPECT_EQ(repository.adapterStates(adapter, names), expected);
    }

    static void expectNoRepository(GitRepository const& files, GitAdapter& adapter) {
        files.write("a");
        EXPECT_EQ(files.adapterStates(adapter, {"a", "", "not there"}),
                  (States{{"a", 8}, {"", 8}, {"not there", 8}}));
        adapter.addToSourceControl(files.paths({"a"}));
        adapter.removeFromSourceControl(files.paths({"a"}));
    }

    test::TemporaryFolder folder;
};

} // namespace project::git

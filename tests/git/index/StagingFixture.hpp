#pragma once

#include <stdexcept>

#include <gmock/gmock.h>

#include "git/GitRepository.hpp"
#include "project/git/GitError.hpp"

namespace project::git {

/// Stages by the adapter, and by git on a copy of the index.
class StagingTest : public GitTest {
protected:
    void add(std::vector<std::string> const& names) { adapter.addToSourceControl(repository.paths(names)); }

    void remove(std::vector<std::string> const& names) {
        adapter.removeFromSourceControl(repository.paths(names));
    }

    std::vector<std::string> tracked() const { return recordsOf(repository.run({"ls-files", "-z"})); }

    /// Runs git on a copy of the index. @return the entries of the copy then.
    std::string indexAfterGit(std::vector<std::string> const& arguments) const {
        auto const copy = folder.onDisk() / "index-copy";
        std::filesystem::remove(copy);
        if (std::filesystem::exists(repository.indexFile())) {
            std::filesystem::copy_file(repository.indexFile(), copy);
            // git reads a file again whose entry is as young as the index; a younger index would hide its
            // change.
            std::filesystem::last_write_time(copy, std::filesystem::last_write_time(repository.indexFile()));
        }
        repository.runOnIndex(copy, arguments);
        return repository.runOnIndex(copy, {"ls-files", "-z", "-s", "-t", "-v"});
    }

    void expectAddedAsGitDoes(std::vector<std::string> const& names) {
        std::vector<std::string> command{"add", "--force", "--sparse", "--"};
        for (auto const& name : names) {
            command.push_back(":(literal)" + name);
        }
        auto const expected = indexAfterGit(command);
        add(names);
        EXPECT_EQ(repository.index(), expected);
    }

    void expectRemovedAsGitDoes(std::vector<std::string> const& names) {
        std::vector<std::string> command{"rm", "-q", "-r", "--cached", "--force", "--sparse", "--"};
        for (auto const& name : names) {
            command.push_back(":(literal)" + name);
        }
        auto const expected = indexAfterGit(command);
        remove(names);
        EXPECT_EQ(repository.index(), expected);
    }

    GitError errorOfAdding(std::vector<std::string> const& names) {
        try {
            add(names);
        } catch (GitError const& error) {
            return error;
        }
        throw std::runtime_error("nothing was thrown");
    }
};

} // namespace project::git

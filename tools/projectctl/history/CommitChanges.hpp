#pragma once

#include <cstddef>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "git/CommitLog.hpp"
#include "history/GitProject.hpp"
#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

/// The changes of a project in the commits of its history.
///
/// The number of processes of git does not grow with the number of commits: one lists the commits that
/// changed the text with their files, and each further one reads the texts of many commits.
class CommitChanges {
public:
    using Changes = std::vector<project::stores::DefinitionChange>;

    /// @return whether to go on.
    using Receiver = std::function<bool(LoggedCommit const& commit, Changes const& changes)>;

    explicit CommitChanges(GitProject const& project) : project_(project) {}

    /// Passes on the commits that changed the project, the youngest first. Of a merge, these are the changes
    /// that none of its parents has. Also follows a project whose root was moved in the repository.
    void forEach(Receiver const& receive);

private:
    using Entries = std::vector<LoggedCommit>;

    /// @return whether to go on.
    bool passOn(Entries const& entries, std::string const& text, Receiver const& receive);
    bool passOnCommit(Entries const& entries, std::size_t begin, std::size_t end, std::string const& text,
                      Receiver const& receive);
    void readTexts(Entries const& entries, std::size_t begin, std::size_t end, std::string const& text);
    Changes changesOf(LoggedCommit const& entry, std::string const& text) const;

    GitProject const& project_;
    std::map<std::string, std::string> texts_; ///< by the ids of their contents
};

} // namespace projectctl

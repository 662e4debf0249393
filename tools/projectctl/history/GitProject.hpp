#pragma once

#include <map>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "git/RawChanges.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A project in a git repository, for questions about its earlier versions.
class GitProject {
public:
    /// The project that contains the working folder.
    /// @param sharedMessage the message for a project that a server stores: git has no versions of it.
    /// @throws Failure if there is no such project, or it is not in a repository.
    explicit GitProject(char const* sharedMessage);

    Path const& root() const noexcept { return root_; }

    /// The path of the text from the top of the repository.
    std::string textInRepository() const;

    /// The renames among some changes, as paths from the project's root. Files outside the project are left
    /// out.
    std::map<std::u16string, std::u16string> renamesIn(std::vector<RawChange> const& changes) const;

    /// The id of a commit. @throws Failure if there is no such commit.
    std::string commit(std::string const& revision) const;

    /// The text in a commit; empty if the commit does not contain the project.
    std::string textIn(std::string const& commit) const;

    /// The text on disk.
    std::string textOnDisk() const;

private:
    Path root_;
    std::string prefix_; ///< the path of the root from the top of the repository, with a "/" at its end
};

} // namespace projectctl

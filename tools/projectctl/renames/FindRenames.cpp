#include "renames/FindRenames.hpp"

#include "cli/Settings.hpp"
#include "git/GitIgnore.hpp"
#include "renames/PersonalRenames.hpp"

namespace projectctl {

Renames findRenames(OpenProject& project, int similarity) {
    bool const usesGit = settings().sourceControl;
    Renames result{project.session().findRenames({.similarity = similarity, .usesGit = usesGit}), {}};
    if (usesGit && isInGitRepository(project.root())) {
        result.personal = findPersonalRenames(project, similarity);
    }
    return result;
}

} // namespace projectctl

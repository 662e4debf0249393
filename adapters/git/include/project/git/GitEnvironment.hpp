#pragma once

namespace project::git {

/// Whether the variables GIT_DIR, GIT_WORK_TREE and GIT_INDEX_FILE of this process apply.
enum class GitEnvironment {
    Ignored,  ///< the project's folder alone determines the repository
    Honoured, ///< as for a git command that is started in the process's working folder
};

} // namespace project::git

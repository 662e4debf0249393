#include "project/git/GitError.hpp"

#include <utility>

namespace project::git {

GitError::GitError(Kind kind, std::string file, std::string problem, std::string remedy)
    : kind_(kind), file_(std::move(file)), problem_(std::move(problem)), remedy_(std::move(remedy)) {
    getStackTrace().capture(0);
    text_ = (file_.empty() ? "" : file_ + ": ") + problem_ + "." + (remedy_.empty() ? "" : " " + remedy_);
}

} // namespace project::git

#include "project/stores/StoreError.hpp"

#include <utility>

namespace project::stores {

StoreError::StoreError(Kind kind, std::string file, std::size_t line, std::string problem, std::string remedy)
    : kind_(kind),
      file_(std::move(file)),
      line_(line),
      problem_(std::move(problem)),
      remedy_(std::move(remedy)) {
    getStackTrace().capture(0);
    if (!file_.empty()) {
        text_ = file_ + (line_ > 0 ? ":" + std::to_string(line_) : "") + ": ";
    }
    text_ += problem_ + ".";
    if (!remedy_.empty()) {
        text_ += " " + remedy_;
    }
}

} // namespace project::stores

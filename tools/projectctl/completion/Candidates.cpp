#include "completion/Candidates.hpp"

namespace projectctl {

void Candidates::add(std::string value, std::string description) {
    if (value.starts_with(typed_)) {
        all_.push_back({std::move(value), std::move(description)});
    }
}

} // namespace projectctl

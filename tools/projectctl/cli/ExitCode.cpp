#include "cli/ExitCode.hpp"

#include <array>
#include <cstddef>

#include "cli/CodedFailure.hpp"
#include "project/git/GitError.hpp"
#include "project/stores/StoreError.hpp"

namespace projectctl {

using project::git::GitError;
using project::stores::StoreError;

std::string_view nameOf(int exitCode) {
    static constexpr std::array<std::string_view, 9> names{"done",     "failed",      "wrong-use",
                                                           "finding",  "busy",        "damaged",
                                                           "conflict", "disk-failed", "outcome-unknown"};
    return names.at(static_cast<std::size_t>(exitCode));
}

int exitCodeFor(std::exception const& error) {
    if (auto const* const coded = dynamic_cast<CodedFailure const*>(&error)) {
        return coded->exitCode();
    }
    auto const* const ofStore = dynamic_cast<StoreError const*>(&error);
    if (ofStore == nullptr) {
        auto const* const ofGit = dynamic_cast<GitError const*>(&error);
        bool const isBusy = ofGit != nullptr && ofGit->kind() == GitError::Kind::Busy;
        return isBusy ? exit_code::busy : exit_code::failed;
    }
    switch (ofStore->kind()) {
    case StoreError::Kind::Refused:
        return exit_code::failed;
    case StoreError::Kind::Busy:
        return exit_code::busy;
    case StoreError::Kind::Damaged:
        return exit_code::damaged;
    case StoreError::Kind::Conflict:
        return exit_code::conflict;
    case StoreError::Kind::DiskFailed:
    case StoreError::Kind::Unreachable:
        return exit_code::diskFailed;
    case StoreError::Kind::OutcomeUnknown:
        return exit_code::outcomeUnknown;
    }
    return exit_code::failed;
}

} // namespace projectctl

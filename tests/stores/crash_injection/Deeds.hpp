#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "Situation.hpp"

namespace project::test {

/// Something that a process does with a project, to the calls of which trouble comes.
struct Deed {
    std::unique_ptr<TextBackend> backend; ///< the process's
    std::function<void(Deed&)> perform;

    Content after; ///< what the project holds then

    std::optional<Content> seen{};         ///< what the process read, if it did
    bool isRefused = false;                ///< it is an error also without trouble
    std::unique_ptr<CrashingDisk> other{}; ///< another process that lasts as long
};

struct KindOfDeed {
    char const* name;
    std::vector<Story> stories; ///< where it can be done
    bool makesDurable;          ///< what the project holds then outlives a power cut

    /// Brings everything to the moment before it, without trouble; the situation may change by that.
    Deed (*make)(Situation& situation, Choices& choices);
};

/// Everything that is done with a project.
std::vector<KindOfDeed> const& kindsOfDeeds();

/// What the next process does that finds a project after somebody died in it.
std::vector<KindOfDeed> recoveriesOf(Story story);

} // namespace project::test

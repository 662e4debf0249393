#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "Situation.hpp"

namespace project::test {

/// An operation of a process on a project. Faults are injected into its calls.
struct StoreOperation {
    std::unique_ptr<TextBackend> backend; ///< the process's
    std::function<void(StoreOperation&)> perform;

    Content after; ///< the content of the project after it

    std::optional<Content> seen{};         ///< the content that the process read, if it did
    bool isRefused = false;                ///< it is an error without a fault, too
    std::unique_ptr<CrashingDisk> other{}; ///< another process, which lives as long
};

struct OperationKind {
    char const* name;
    std::vector<History> histories; ///< the histories that it applies to
    bool makesDurable;              ///< its result survives a power cut

    /// Prepares everything up to the moment before it, without faults; this may change the situation.
    StoreOperation (*make)(Situation& situation, Choices& choices);
};

/// All operations on a project.
std::vector<OperationKind> const& operationKinds();

/// The operations of the next process after another one died.
std::vector<OperationKind> recoveriesOf(History history);

} // namespace project::test

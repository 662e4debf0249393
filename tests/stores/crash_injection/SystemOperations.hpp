#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

namespace project::test {

/// A project in a real folder, and a process that runs an operation on it.
struct RealProject {
    TemporaryFolder root;
    std::unique_ptr<TextBackend> backend;

    std::unique_ptr<TextBackend> open(TextBackend::Options options) const;
    std::string text() const;
    std::vector<std::string> names() const;
};

/// An operation on a project in a real folder.
struct SystemOperation {
    char const* name;
    std::optional<std::string> text; ///< of the project before it; nothing for no store
    TextBackend::Options options;
    std::function<void(RealProject&)> prepare; ///< brings the process to the moment before the operation
    std::function<void(RealProject&)> perform;
    Content before{};
    Content after{};
};

/// Creates the project for an operation.
std::unique_ptr<RealProject> projectFor(SystemOperation const& operation);

/// All operations on a project.
std::vector<SystemOperation> systemOperations();

/// Writes that are affected by missing features of a file system.
SystemOperation appendingOperation();
SystemOperation rewritingOperation();
SystemOperation creatingOperation();

} // namespace project::test

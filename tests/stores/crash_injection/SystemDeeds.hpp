#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

namespace project::test {

/// A project in a real folder, and a process that is going to do something with it.
struct RealProject {
    TemporaryFolder root;
    std::unique_ptr<TextBackend> backend;

    std::unique_ptr<TextBackend> open(TextBackend::Options options) const;
    std::string text() const;
    std::vector<std::string> names() const;
};

/// Something that is done with a project in a real folder.
struct SystemDeed {
    char const* name;
    std::optional<std::string> text; ///< what stands in the project before; nothing for no store
    TextBackend::Options options;
    std::function<void(RealProject&)> prepare; ///< brings the process to the moment before it
    std::function<void(RealProject&)> perform;
    Content before;
    Content after;
};

/// Makes the project that a deed begins with.
std::unique_ptr<RealProject> projectFor(SystemDeed const& deed);

/// Everything that is done with a project.
std::vector<SystemDeed> systemDeeds();

/// A write, as it is done where the file system has its ways.
SystemDeed appendingDeed();
SystemDeed rewritingDeed();
SystemDeed creatingDeed();

} // namespace project::test

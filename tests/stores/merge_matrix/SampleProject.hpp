#pragma once

#include <functional>
#include <optional>
#include <string>

#include "project/core/ProjectManager.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::test {

using management::ProjectManager;

/// A change to a project. The folder is the project's root.
using Action = std::function<void(ProjectManager&, TemporaryFolder const&)>;

/// How a store writes a small text.
enum class Writing {
    Rewriting,
    Appending, ///< each batch goes into the tail
};

/// A project with the managers and the text store that applications use. Its files are in a folder of their
/// own, whether or not they are in the project; its text is on a disk in memory, since a merge does not
/// depend on the disk, and a real one is too slow for hundreds of pairs.
class SampleProject {
public:
    SampleProject();

    /// The text of a version of the project after a change.
    /// @param text the version; empty for a project that does not exist yet.
    std::string after(std::string const& text, Action const& action,
                      Writing writing = Writing::Rewriting) const;

    /// The same; nothing if the managers refuse the action.
    std::optional<std::string> afterIfAllowed(std::string const& text, Action const& action) const;

private:
    TemporaryFolder folder_;
};

} // namespace project::test

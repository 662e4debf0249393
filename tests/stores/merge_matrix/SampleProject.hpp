#pragma once

#include <functional>
#include <optional>
#include <string>

#include "project/core/ProjectManager.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::test {

using management::ProjectManager;

/// Something that somebody does in a project. The folder is the project's root.
using Action = std::function<void(ProjectManager&, TemporaryFolder const&)>;

/// How a store writes a small text.
enum class Writing {
    Anew,
    Appending, ///< each batch goes into the tail
};

/// A project with the managers and the text store that applications use. Its files are in a folder of their
/// own, whether or not they are in the project; its text is on a disk in memory, since a merge asks nothing
/// of disks and real ones make hundreds of pairs wait.
class SampleProject {
public:
    SampleProject();

    /// The text of the project once somebody has done something in a version of it.
    /// @param text the version; an empty one for a project that is yet to be made.
    std::string after(std::string const& text, Action const& action, Writing writing = Writing::Anew) const;

    /// The same, with nothing where the managers refuse the action.
    std::optional<std::string> afterIfAllowed(std::string const& text, Action const& action) const;

private:
    TemporaryFolder folder_;
};

} // namespace project::test

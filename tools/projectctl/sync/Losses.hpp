#pragma once

#include <string>
#include <vector>

#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// The labels and entry points that a synchronisation removes with their files.
class Losses {
public:
    /// @param plan borrowed.
    Losses(OpenProject& project, project::session::SyncPlan const& plan)
        : project_(project), plan_(plan), shown_(project.root()) {}

    /// Writes a warning for each file that loses something.
    void warn();

    /// The labels that a file loses, in the form CATEGORY=LABEL.
    std::vector<std::u16string> labelsOf(project::session::RemovedFile const& file) const;

private:
    std::string described(project::session::RemovedFile const& file) const;
    std::u16string nameOf(project::session::LabelChoice const& label) const;

    OpenProject& project_;
    project::session::SyncPlan const& plan_;
    ShownPaths shown_;
};

} // namespace projectctl

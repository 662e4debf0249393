#include "project/ProjectCommand.hpp"

namespace projectctl {

int ProjectCommand::run() {
    auto project = OpenProject::ofWorkingFolder();
    auto const result = run(project);
    project.stage();
    project.warnOfReset();
    project.showHint();
    return result;
}

} // namespace projectctl

#include "project/ProjectCommand.hpp"

namespace projectctl {

int ProjectCommand::run() {
    auto project = OpenProject::ofWorkingFolder();
    int result = 0;
    try {
        result = run(project);
        project.stage();
    } catch (...) {
        project.reportRecoveredMoves();
        throw;
    }
    project.reportRecoveredMoves();
    project.warnOfReset();
    project.showHint();
    return result;
}

} // namespace projectctl

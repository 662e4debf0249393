#include "checks/MergeSetupCheck.hpp"

#include "cli/Settings.hpp"
#include "git/MergeSetup.hpp"

namespace projectctl {

void checkMergeSetup(fl::filesystem::Path const& root, Findings& findings) {
    if (!settings().sourceControl) {
        return;
    }
    switch (mergeSetupOf(root)) {
    case MergeSetup::NotAssigned:
        findings.push_back(Finding::note(
            code::mergeNotAssigned, "git merges the project's text line by line: the attribute 'merge' of "
                                    ".projectdata/project.jsonl is not 'project-definition'"));
        break;
    case MergeSetup::Missing:
        findings.push_back(Finding::note(code::mergeNotSetUp,
                                         "git merges the project's text line by line: 'projectctl setup' "
                                         "configures the merge driver"));
        break;
    case MergeSetup::OtherCommand:
        findings.push_back(Finding::note(
            code::mergeOtherCommand, "git merges the project's text with another command than the one that "
                                     "'projectctl setup' configures"));
        break;
    case MergeSetup::ProgramMissing:
        findings.push_back(Finding::fault(
            code::mergeProgramMissing, "git merges the project's text line by line: the merge driver calls a "
                                       "program that cannot be run; 'projectctl setup' configures it again"));
        break;
    case MergeSetup::NoRepository:
    case MergeSetup::Works:
        break;
    }
}

} // namespace projectctl

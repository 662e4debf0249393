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
        findings.push_back(Finding::note(code::mergeNotAssigned, Message("MergeNotAssigned")));
        break;
    case MergeSetup::Missing:
        findings.push_back(Finding::note(code::mergeNotSetUp, Message("MergeNotSetUp")));
        break;
    case MergeSetup::OtherCommand:
        findings.push_back(Finding::note(code::mergeOtherCommand, Message("MergeOtherCommand")));
        break;
    case MergeSetup::ProgramMissing:
        findings.push_back(Finding::fault(code::mergeProgramMissing, Message("MergeProgramMissing")));
        break;
    case MergeSetup::NoRepository:
    case MergeSetup::Works:
        break;
    }
}

} // namespace projectctl

#pragma once

#include "project/OpenProject.hpp"

namespace projectctl {

/// Whether a person could use a hint. Otherwise the files that a command changes need not be counted.
bool wantsUndoHint(OpenProject& project);

/// Notes for the end of the command how git undoes the changes of the open project, if that is wanted, the
/// changes concern many files, and git restores exactly the earlier state.
///
/// Git does if it tracks the text and the text is as in the last commit. Changes of the file list are also in
/// git's index, which must not contain other changes then.
///
/// Call it before the commit, while the text on disk is the earlier one. It does nothing in a transaction
/// within another one.
void noteUndoHint(OpenProject& project);

} // namespace projectctl

#include "changes/DryRun.hpp"

#include "changes/ChangeLines.hpp"
#include "changes/TransactionChanges.hpp"
#include "changes/UndoHint.hpp"

namespace projectctl {

void DryRun::declare(CLI::App& app) {
    app.add_flag(option, isOn_);
    app.add_flag("--json", isJson_);
}

bool DryRun::end(ProjectTransaction& transaction, OpenProject& project) const {
    if (isOn_) {
        auto const changes = changesOfTransaction(project);
        ChangeLines(project, changes, isJson_).write();
    } else {
        noteUndoHint(project);
        transaction.commit();
    }
    return !isOn_;
}

} // namespace projectctl

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
        ChangeLines lines(project, isJson_);
        lines.write(changesOfTransaction(project));
        lines.writePersonal(personalChangesOfTransaction(project));
        lines.finish();
    } else {
        noteUndoHint(project);
        transaction.commit();
    }
    return !isOn_;
}

} // namespace projectctl

#include "Verbs.hpp"

#include "batch/Commands.hpp"
#include "checks/Commands.hpp"
#include "cli/HelpCommand.hpp"
#include "completion/Commands.hpp"
#include "entrypoints/Commands.hpp"
#include "exchange/Commands.hpp"
#include "files/Additions.hpp"
#include "files/Commands.hpp"
#include "history/Commands.hpp"
#include "labels/Commands.hpp"
#include "merge/Commands.hpp"
#include "project/Commands.hpp"
#include "references/Commands.hpp"
#include "renames/Commands.hpp"
#include "report/Commands.hpp"
#include "shared/Commands.hpp"
#include "sync/Commands.hpp"
#include "watch/Commands.hpp"

namespace projectctl {

CommandList const& verbs() {
    static CommandList const result{
        {"init", "PurposeProject", [] { return makeInitCommand(addWholeTree); }},
        {"root", "PurposeProject", makeRootCommand},
        {"name", "PurposeProject", makeNameCommand},
        {"description", "PurposeProject", makeDescriptionCommand},

        {"add", "PurposeFiles", makeAddCommand},
        {"remove", "PurposeFiles", makeRemoveCommand},
        {"move", "PurposeFiles", makeMoveCommand},
        {"adopt", "PurposeFiles", makeAdoptCommand},
        {"list", "PurposeFiles", makeListCommand},
        {"status", "PurposeFiles", makeStatusCommand},
        {"sync", "PurposeFiles", makeSyncCommand},
        {"report", "PurposeFiles", makeReportCommand},
        {"import", "PurposeFiles", makeImportCommand},
        {"export", "PurposeFiles", makeExportCommand},

        {"category", "PurposeLabels", makeCategoryCommand},
        {"label", "PurposeLabels", makeLabelCommand},

        {"entry", "PurposeEntryPoints", makeEntryCommand},
        {"group", "PurposeEntryPoints", makeGroupCommand},

        {"path", "PurposeReferences", makePathCommand},
        {"reference", "PurposeReferences", makeReferenceCommand},
        {"references", "PurposeReferences", makeReferencesCommand},

        {"check", "PurposeText", makeCheckCommand},
        {"tidy", "PurposeText", makeTidyCommand},
        {"log", "PurposeText", makeLogCommand},
        {"diff", "PurposeText", makeDiffCommand},
        {"setup", "PurposeText", makeSetupCommand},
        {"merge", "PurposeText", makeMergeCommand},
        {"resolve", "PurposeText", makeResolveCommand},
        {"textconv", "PurposeText", makeTextconvCommand},

        {"copy", "PurposeShared", makeCopyCommand},
        {"shared", "PurposeShared", makeSharedCommand},

        {"batch", "PurposeScripts", [] { return makeBatchCommand(verbs()); }},
        {"watch", "PurposeScripts", makeWatchCommand},

        {"help", "PurposeHelp", [] { return makeHelpCommand(verbs()); }},
        {completeCommandName, hiddenPurpose, [] { return makeCompleteCommand(verbs()); }},
    };
    return result;
}

} // namespace projectctl

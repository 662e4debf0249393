#include "exchange/ImportCommand.hpp"

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "exchange/ItemImport.hpp"
#include "output/JsonDocument.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"

namespace projectctl {

namespace {

int writeDocument(ItemImport const& import, Unmapped& unmapped) {
    JsonDocument document(json::imported);
    document.addNumber("files", import.addedFiles());
    document.addNumber("labels", import.putLabels());
    int const result = unmapped.addTo(document);
    document.finish();
    return result;
}

} // namespace

int ImportCommand::run(OpenProject& project) {
    auto const data = load(project);
    Unmapped unmapped(source(project));
    Progress const progress(Message("ProgressImport"));
    ProjectTransaction transaction(project);
    auto const items = itemsIn(data, project, unmapped);
    ItemImport import(project, items, unmapped);
    import.run();
    project.changedFiles().listed += import.addedFiles();
    project.changedFiles().labelled += import.putLabels();
    if (dryRun_.end(transaction, project)) {
        if (dryRun_.isJson()) {
            return writeDocument(import, unmapped);
        }
        output().say(Message("Imported", import.addedFiles(), import.putLabels()));
    }
    return unmapped.report();
}

CLI::App* ImportCommand::declareForm(CLI::App& group, std::string const& name) {
    auto* const app = group.add_subcommand(name);
    dryRun_.declare(*app);
    return app;
}

void ImportCommand::declareFile(CLI::App& app) {
    completes(takeText(app, "FILE", file_), Completes::Files);
}

} // namespace projectctl

#include "history/ChangeJson.hpp"

#include "history/ChangeWords.hpp"

namespace projectctl {

namespace {

using project::stores::DefinitionChange;
using Subject = DefinitionChange::Subject;

void addValues(JsonRows& row, std::vector<DefinitionChange::Value> const& values) {
    row.addKey("values");
    JsonRows rows;
    for (auto const& value : values) {
        rows.begin();
        rows.addText("key", value.key);
        rows.addText("before", value.before);
        rows.addText("after", value.after);
    }
    rows.finish();
}

} // namespace

void addChanges(JsonRows& rows, std::vector<DefinitionChange> const& changes) {
    for (auto const& change : changes) {
        rows.begin();
        rows.addText("subject", wordFor(change.subject));
        rows.addText("change", wordFor(change.kind));
        rows.addText("name", change.name);
        if (!change.earlier.empty()) {
            rows.addText("earlier", change.earlier);
        }
        if (!change.category.empty()) {
            rows.addText(change.subject == Subject::FileData ? "address" : "category", change.category);
        }
        if (change.subject == Subject::FileLabel) {
            rows.addText("label", change.label);
        }
        if (change.subject == Subject::File) {
            rows.addText("kind", change.isFolder ? u"folder" : u"file");
            rows.addFlag("withFolder", change.isWithFolder);
        }
        addValues(rows, change.values);
    }
}

} // namespace projectctl

#include "sync/RuleForms.hpp"

#include <set>
#include <string>

#include "cli/ShownPaths.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

void writeOptions(char const* option, std::set<std::u16string> const& patterns) {
    for (auto const& pattern : patterns) {
        output().text() += option + withoutControls(quotedForShell(bytesOf(pattern)), false);
    }
}

} // namespace

void writeRules(OpenProject& project) {
    ShownPaths shown(project.root());
    for (auto const& rule : project.session().syncRules()) {
        output().name(shown.ofAbsolute(rule.folder));
        writeOptions(" --include ", rule.included);
        writeOptions(" --exclude ", rule.excluded);
        output().text() += rule.usesGitIgnore ? "\n" : " --no-gitignore\n";
    }
}

void writeRulesAsJson(OpenProject& project) {
    JsonRows rows(json::syncRules, "rules");
    for (auto const& rule : project.session().syncRules()) {
        rows.begin();
        rows.addText("folder", project::metadata::getRelativePath(project.root(), rule.folder));
        rows.addList("include", {rule.included.begin(), rule.included.end()});
        rows.addList("exclude", {rule.excluded.begin(), rule.excluded.end()});
        rows.addFlag("gitignore", rule.usesGitIgnore);
    }
    rows.finish();
}

} // namespace projectctl

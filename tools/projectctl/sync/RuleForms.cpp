#include "sync/RuleForms.hpp"

#include <set>
#include <string>

#include "cli/ShownPaths.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

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

} // namespace projectctl

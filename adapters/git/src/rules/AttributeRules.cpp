#include "rules/AttributeRules.hpp"

#include "repository/FileContent.hpp"

namespace project::git {

namespace {

constexpr auto builtIn = "[attr]binary -diff -merge -text\n";
constexpr auto ofSystem = "/etc/gitattributes"; // the path in Debian's git

std::vector<AttributeLine> readLines(std::string const& file) {
    return readAttributeLines(readFile(file, Links::Followed).value_or(""));
}

} // namespace

AttributeRules::AttributeRules(Repository const& repository)
    : repository_(repository),
      isCaseIgnored_(repository.isSet("core.ignoreCase", false)),
      own_(readLines(libgit().git_repository_commondir(repository.get()) + std::string("info/attributes"))) {
    std::string const configured = repository.configuredPath("core.attributesFile");
    general_ = {readLines(configured.empty() ? repository.usersFile("attributes") : configured),
                readLines(ofSystem), readAttributeLines(builtIn)};
    for (auto lines = general_.rbegin(); lines != general_.rend(); ++lines) {
        defineMacros(*lines);
    }
    defineMacros(ofFolder(TreePath())); // no other folder may define macros
    defineMacros(own_);
}

AttributeRules::Values AttributeRules::of(TreePath const& path) {
    std::string_view const whole = path;
    Values result;
    applyMatching(own_, whole, result);
    for (std::string folder = path; !folder.empty();) {
        folder = parentOf(folder);
        applyMatching(ofFolder(folder), folder.empty() ? whole : whole.substr(folder.size() + 1), result);
    }
    for (auto const& lines : general_) {
        applyMatching(lines, whole, result);
    }
    return result;
}

AttributeRules::Lines const& AttributeRules::ofFolder(TreePath const& folder) {
    auto const known = folders_.find(folder);
    if (known != folders_.end()) {
        return known->second;
    }
    std::string const file = folder.empty() ? ".gitattributes" : folder + "/.gitattributes";
    return folders_.try_emplace(folder, readAttributeLines(repository_.contentOf(file))).first->second;
}

void AttributeRules::defineMacros(Lines const& lines) {
    for (auto const& line : lines) {
        if (!line.macro.empty()) {
            macros_.insert_or_assign(line.macro, line.states);
        }
    }
}

/// The last line that sets an attribute decides.
void AttributeRules::applyMatching(Lines const& lines, std::string_view path, Values& values) const {
    for (auto line = lines.rbegin(); line != lines.rend(); ++line) {
        if (line->pattern && line->pattern->isMatch(path, false, isCaseIgnored_)) {
            apply(line->states, values);
        }
    }
}

void AttributeRules::apply(States const& states, Values& values) const {
    for (auto state = states.rbegin(); state != states.rend(); ++state) {
        bool const isNew = values.try_emplace(state->name, state->value).second;
        auto const macro = isNew && state->value.kind == AttributeValue::Kind::Set ? macros_.find(state->name)
                                                                                   : macros_.end();
        if (macro != macros_.end()) {
            apply(macro->second, values);
        }
    }
}

} // namespace project::git

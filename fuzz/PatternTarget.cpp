#include <string>

#include "Target.hpp"
#include "rules/AttributeLine.hpp"
#include "rules/IgnoreRules.hpp"
#include "rules/NamePattern.hpp"

namespace {

using namespace project::fuzz;
using project::git::AttributeLine;
using project::git::IgnoreLine;
using project::git::NamePattern;

/// A pattern that matches a file also matches a folder of that name, and its answer is always the same.
void checkPattern(NamePattern const& pattern, std::string_view path) {
    for (bool const ignoresCase : {false, true}) {
        bool const asFile = pattern.isMatch(path, false, ignoresCase);
        bool const asFolder = pattern.isMatch(path, true, ignoresCase);
        require(!asFile || asFolder, "a pattern that matches a file matches a folder");
        require(asFile == pattern.isMatch(path, false, ignoresCase), "a pattern gives the same answer again");
    }
}

/// A line of an ignore or attributes file, and a path.
void run(std::string_view input) {
    std::size_t const end = std::min(input.find('\n'), input.size());
    std::string_view const line = input.substr(0, end);
    std::string_view const path = input.substr(std::min(end + 1, input.size()));
    if (auto const ignored = IgnoreLine::read(line)) {
        checkPattern(ignored->pattern, path);
    }
    if (auto const attributes = AttributeLine::read(line); attributes && attributes->pattern) {
        checkPattern(*attributes->pattern, path);
    }
    project::git::readAttributeLines(input);
}

Registration const registration("pattern", run);

} // namespace

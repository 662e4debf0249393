#include "cli/UsageProblem.hpp"

#include <optional>
#include <string_view>
#include <vector>

#include "cli/CommonOptions.hpp"
#include "cli/Nearest.hpp"
#include "cli/TextArguments.hpp"
#include "cli/VerbTree.hpp"

namespace projectctl {

namespace {

/// A member of another group with exactly this name, with the group: "label put" for "put".
std::optional<std::string> memberElsewhere(CLI::App const& group, std::string const& word) {
    for (auto const* verb : membersOf(group)) {
        for (auto const* member : membersOf(*verb)) {
            if (member->get_name() == word) {
                return verb->get_name() + ' ' + word;
            }
        }
    }
    return std::nullopt;
}

std::optional<std::string> meantVerb(CLI::App const& group, std::string const& word) {
    std::vector<std::string> names;
    for (auto const* member : membersOf(group)) {
        names.push_back(member->get_name());
    }
    auto const near = nearest(word, names);
    return near ? near : memberElsewhere(group, word);
}

std::optional<std::string> meantOption(CLI::App const& verb, std::string const& word) {
    auto names = commonOptions();
    for (auto const* option : verb.get_options()) {
        for (auto const& name : option->get_lnames()) {
            names.push_back("--" + name);
        }
    }
    return nearest(word.substr(0, word.find('=')), names);
}

/// Two names that the parser's text has on both sides of a word.
Message aboutTwo(char const* name, std::string_view text, std::string_view between) {
    auto const at = text.find(between);
    return Message(name, text.substr(0, at), text.substr(at + between.size()));
}

template <class Kind>
bool is(CLI::ParseError const& error) {
    return dynamic_cast<Kind const*>(&error) != nullptr;
}

Message problemOf(CLI::ParseError const& error, CLI::App const& verb) {
    std::string const text = withoutMarks(error.what());
    bool const isGroup = !membersOf(verb).empty();
    if (auto const unknown = verb.remaining(); !unknown.empty() && (isGroup || is<CLI::ExtrasError>(error))) {
        auto const word = unmarked(unknown.front());
        bool const isOption = unknown.front().starts_with('-');
        auto const meant = isOption  ? meantOption(verb, word)
                           : isGroup ? meantVerb(verb, word)
                                     : std::nullopt;
        std::string const problem = isGroup    ? "UnknownVerb"
                                    : isOption ? "UnknownOption"
                                               : "UnexpectedArgument";
        return meant ? Message(problem + "Meant", word, *meant) : Message(problem, word);
    }
    if (is<CLI::RequiredError>(error)) {
        return isGroup ? Message("VerbMissing")
                       : Message("ArgumentMissing", text.substr(0, text.rfind(" is required")));
    }
    if (is<CLI::ExcludesError>(error)) {
        return aboutTwo("OptionsExclude", text, " excludes ");
    }
    if (is<CLI::RequiresError>(error)) {
        return aboutTwo("OptionRequires", text, " requires ");
    }
    if (is<CLI::ArgumentMismatch>(error)) {
        return Message("ValueMismatch", text.substr(0, text.find(':')));
    }
    return Message("ArgumentsWrong", text);
}

} // namespace

WrongUse wrongUse(CLI::ParseError const& error, CLI::App const& tool) {
    auto const& called = calledVerb(tool);
    return WrongUse(Message("WrongUse", problemOf(error, called).text(), callOf(called)));
}

Message unknownVerb(CLI::App const& group, std::string const& word) {
    auto const meant = meantVerb(group, word);
    auto const problem = meant ? Message("UnknownVerbMeant", word, *meant) : Message("UnknownVerb", word);
    return Message("WrongUse", problem.text(), callOf(group));
}

} // namespace projectctl

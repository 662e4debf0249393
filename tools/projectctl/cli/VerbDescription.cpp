#include "cli/VerbDescription.hpp"

#include "cli/ExitCode.hpp"
#include "cli/VerbTree.hpp"
#include "texts/Message.hpp"
#include "texts/VerbText.hpp"

namespace projectctl {

namespace {

/// The name of the text with the summary of a verb.
std::string keyOf(CLI::App const& verb) {
    auto const name = wordsOf(verb);
    return name.empty() ? "projectctl" : name;
}

std::string joined(std::string const& verb, std::string const& rest) {
    return verb.empty() ? rest : verb + ' ' + rest;
}

/// The text of this verb's option, else that of all verbs with the option.
std::string optionText(std::string const& verb, std::string const& option) {
    auto text = verbText(joined(verb, option));
    return text.empty() ? verbText(option) : text;
}

std::vector<std::string> namesOf(CLI::Option const& option) {
    if (option.get_positional()) {
        return {option.get_name(true)};
    }
    std::vector<std::string> names;
    for (auto const& name : option.get_snames()) {
        names.push_back('-' + name);
    }
    for (auto const& name : option.get_lnames()) {
        names.push_back("--" + name);
    }
    return names;
}

OptionDescription describe(CLI::Option const& option, std::string const& verb) {
    OptionDescription result;
    result.names = namesOf(option);
    result.text = optionText(verb, result.names.back());
    if (!option.get_positional() && option.get_items_expected_max() > 0) {
        result.value = optionText(verb, result.names.back() + '=');
        if (result.value.empty()) {
            result.value = Message("HelpValue").text();
        }
    }
    result.isRequired = option.get_required();
    result.isRepeated = option.get_expected_max() > 1;
    return result;
}

} // namespace

std::string VerbDescription::call() const {
    return name.empty() ? "projectctl" : "projectctl " + name;
}

std::string VerbDescription::usage() const {
    std::string result = call() + " [" + Message("HelpOptions").text() + ']';
    if (!members.empty()) {
        return result + ' ' + Message("HelpVerb").text();
    }
    for (auto const& argument : arguments) {
        auto const word = argument.names.front() + (argument.isRepeated ? "..." : "");
        result += ' ' + (argument.isRequired ? word : '[' + word + ']');
    }
    return result;
}

std::string summaryOf(CLI::App const& verb) {
    return verbText(keyOf(verb));
}

std::string descriptionOf(CLI::Option const& option, CLI::App const& verb) {
    return optionText(wordsOf(verb), namesOf(option).back());
}

VerbDescription describe(CLI::App const& declared) {
    VerbDescription result;
    result.name = wordsOf(declared);
    auto const key = keyOf(declared);
    result.summary = summaryOf(declared);
    result.purpose = declared.get_group();
    result.details = verbText(key + ": details");
    result.example = verbText(key + ": example");
    for (auto const* option : declared.get_options()) {
        auto& list = option->get_positional() ? result.arguments : result.options;
        list.push_back(describe(*option, result.name));
    }
    for (auto const* member : membersOf(declared)) {
        if (!isHidden(*member)) {
            result.members.push_back(describe(*member));
        }
    }
    return result;
}

std::vector<ExitCodeDescription> describeExitCodes() {
    std::vector<ExitCodeDescription> result;
    for (int code = exit_code::done; code <= exit_code::outcomeUnknown; ++code) {
        auto const number = std::to_string(code);
        result.push_back({number, Message("ExitCode" + number).text()});
    }
    return result;
}

} // namespace projectctl

#include "manual/ManualPage.hpp"

#include <algorithm>
#include <cctype>
#include <cstddef>
#include <string_view>
#include <vector>

#include "texts/Message.hpp"

namespace projectctl {

namespace {

/// Text for a line of its own, or behind the macro of a line.
std::string escaped(std::string_view text) {
    std::string result;
    for (char const byte : text) {
        result += byte == '\\' ? "\\e" : std::string(1, byte);
    }
    return result.starts_with('.') || result.starts_with('\'') ? "\\&" + result : result;
}

/// The length that mandoc counts: a character that is not ASCII is spelt out.
std::size_t lengthOf(std::string_view word) {
    constexpr std::size_t spelt = 8;
    std::size_t result = 0;
    for (char const byte : word) {
        auto const value = static_cast<unsigned char>(byte);
        result += value < 0x80 ? 1 : (value >= 0xC0 ? spelt : 0);
    }
    return result;
}

/// A sentence in lines of at most 80 characters.
std::string wrapped(std::string_view sentence) {
    constexpr std::size_t widest = 78;
    std::string result;
    std::string line;
    while (!sentence.empty()) {
        auto const word = sentence.substr(0, sentence.find(' '));
        sentence.remove_prefix(std::min(word.size() + 1, sentence.size()));
        if (!line.empty() && lengthOf(line) + 1 + lengthOf(word) > widest) {
            result += escaped(line) + '\n';
            line.clear();
        }
        line += (line.empty() ? "" : " ") + std::string(word);
    }
    return result + escaped(line) + '\n';
}

/// Sentences, each of which begins a line, as mdoc wants them.
std::string paragraph(std::string_view text) {
    std::string result;
    while (!text.empty()) {
        auto const end = std::min(text.find(". "), text.size() - 1);
        result += wrapped(text.substr(0, end + 1));
        text.remove_prefix(std::min(end + 2, text.size()));
    }
    return result;
}

/// The words of a call: options in brackets and placeholders are set apart.
std::string synopsisOf(VerbDescription const& verb) {
    std::string result = ".Nm projectctl\n";
    if (!verb.name.empty()) {
        result += ".Cm " + verb.name + '\n';
    }
    result += ".Op Ar " + Message("HelpOptions").text() + '\n';
    for (auto const& argument : verb.arguments) {
        result += (argument.isRequired ? ".Ar " : ".Op Ar ") + argument.names.front() +
                  (argument.isRepeated ? " ..." : "") + '\n';
    }
    return verb.members.empty() ? result : result + ".Ar " + Message("HelpVerb").text() + '\n';
}

std::string itemOf(OptionDescription const& option, bool isArgument) {
    std::string result = ".It";
    for (auto const& name : option.names) {
        result += (&name == &option.names.front() ? " " : " , ") + std::string(isArgument ? "Ar " : "Fl ") +
                  (isArgument ? name : name.substr(1));
    }
    result += option.value.empty() ? "" : " Ar " + option.value;
    return result + '\n' + paragraph(option.text + (option.text.ends_with('.') ? "" : "."));
}

std::string listOf(std::vector<OptionDescription> const& options, bool areArguments) {
    std::string result;
    for (auto const& option : options) {
        result += itemOf(option, areArguments);
    }
    return result;
}

std::string descriptionOf(VerbDescription const& verb) {
    std::string result = paragraph(verb.summary + '.' + (verb.details.empty() ? "" : ' ' + verb.details));
    result += ".Bl -tag -width Ds\n" + listOf(verb.arguments, true) + listOf(verb.options, false);
    return result + ".El\n";
}

std::string exampleOf(VerbDescription const& verb) {
    return verb.example.empty() ? "" : ".Dl $ " + escaped(verb.example) + '\n';
}

std::string membersOf(VerbDescription const& verb) {
    std::string result;
    for (auto const& member : verb.members) {
        result += ".Ss " + member.call() + '\n' + synopsisOf(member) + ".Pp\n" + descriptionOf(member) +
                  ".Pp\n" + exampleOf(member);
    }
    return result;
}

std::string verbsOf(VerbDescription const& tool) {
    std::string result = ".Bl -tag -width Ds\n";
    for (auto const& verb : tool.members) {
        result += ".It Xr " + manualNameOf(verb) + " 1\n" + paragraph(verb.summary + '.');
    }
    return result + ".El\n";
}

std::string exitCodes() {
    std::string result = ".Bl -tag -width Ds\n";
    for (auto const& [code, text] : describeExitCodes()) {
        result += ".It " + code + '\n' + paragraph(text + '.');
    }
    return result + ".El\n" + paragraph(Message("HelpOfVerbs").text());
}

std::string headOf(VerbDescription const& verb, std::string const& date) {
    auto title = manualNameOf(verb);
    std::ranges::transform(title, title.begin(), [](unsigned char byte) { return std::toupper(byte); });
    return ".Dd " + date + "\n.Dt " + title + " 1\n.Os\n.Sh NAME\n.Nm " + manualNameOf(verb) + "\n.Nd " +
           escaped(verb.summary) + "\n.Sh SYNOPSIS\n" + synopsisOf(verb);
}

} // namespace

std::string manualNameOf(VerbDescription const& verb) {
    return verb.name.empty() ? "projectctl" : "projectctl-" + verb.name;
}

std::string manualPageOf(VerbDescription const& verb, std::string const& date) {
    bool const isTool = verb.name.empty();
    std::string result = headOf(verb, date) + ".Sh DESCRIPTION\n" + descriptionOf(verb);
    if (isTool) {
        return result + ".Ss " + Message("HelpMembers").text() + '\n' + verbsOf(verb) + ".Sh EXIT STATUS\n" +
               exitCodes();
    }
    result += membersOf(verb);
    auto const common = Message("HelpCommonOptions").text();
    result += (verb.members.empty() ? ".Pp\n" : ".Ss " + Message("HelpOptionsHeading").text() + '\n') +
              paragraph(common);
    return result + ".Sh EXAMPLES\n" + exampleOf(verb) + ".Sh SEE ALSO\n.Xr projectctl 1\n";
}

} // namespace projectctl

#include "manual/GuidePage.hpp"

#include <string_view>
#include <vector>

#include "cli/WrappedText.hpp"
#include "texts/Message.hpp"

namespace projectctl {

namespace {

std::string inCode(std::string const& text) {
    return '`' + text + '`';
}

std::string sentence(std::string const& text) {
    return text + (text.ends_with('.') ? "" : ".");
}

/// Text of the catalog, in which no character may begin a markup.
std::string inMarkdown(std::string_view text) {
    std::string result;
    for (char const byte : text) {
        bool const isMarkup = std::string_view("\\`*_<>[]|").find(byte) != std::string_view::npos;
        result += isMarkup ? "\\" : "";
        result += byte;
    }
    return result;
}

void appendOptions(std::string& out, std::vector<OptionDescription> const& options) {
    for (auto const& option : options) {
        if (option.names.back() == "--help") {
            continue; // the page itself
        }
        std::string names;
        for (auto const& name : option.names) {
            names += (names.empty() ? "" : ", ") + name;
        }
        names += option.value.empty() ? "" : ' ' + option.value;
        appendWrapped(out, "- " + inCode(names) + ": " + inMarkdown(sentence(option.text)), 0, 2);
    }
}

void appendVerb(std::string& out, VerbDescription const& verb) {
    if (!verb.members.empty()) {
        for (auto const& member : verb.members) {
            appendVerb(out, member);
        }
        return;
    }
    out += "\n### " + verb.name + "\n\n";
    auto const details = verb.details.empty() ? std::string() : ' ' + verb.details;
    appendWrapped(out, inMarkdown(sentence(verb.summary) + details), 0, 0);
    out += "\n    " + verb.usage() + '\n';
    if (!verb.example.empty()) {
        out += "    $ " + verb.example + '\n';
    }
    if (!verb.arguments.empty() || !verb.options.empty()) {
        out += '\n';
    }
    appendOptions(out, verb.arguments);
    appendOptions(out, verb.options);
}

} // namespace

std::string guidePageOf(VerbDescription const& tool) {
    std::string out = "# The commands of projectctl\n\n";
    appendWrapped(out,
                  "`scripts/guide` writes this page from the texts of the help; a test compares both. "
                  "[projectctl by example](projectctl.md) shows the commands at work.",
                  0, 0);
    std::string purpose;
    for (auto const& verb : tool.members) {
        if (verb.purpose != purpose) {
            purpose = verb.purpose;
            out += "\n## " + Message(purpose).text() + '\n';
        }
        appendVerb(out, verb);
    }
    out += "\n## Options of every command\n\n";
    appendOptions(out, tool.options);
    return out;
}

} // namespace projectctl

#include "cli/HelpFormatter.hpp"

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

#include "cli/WrappedText.hpp"
#include "output/Colors.hpp"
#include "texts/Message.hpp"

namespace projectctl {

namespace {

using Rows = std::vector<std::pair<std::string, std::string>>;

constexpr std::size_t indent = 2;
constexpr std::size_t widestFirst = 20; ///< a longer first column has a line of its own

void appendHeading(std::string& out, std::string const& message) {
    out += '\n' + colored(Color::Heading, Message(message).text() + ':') + '\n';
}

/// Two columns, of which the second is wrapped.
void appendRows(std::string& out, Rows const& rows) {
    std::size_t widest = 0;
    for (auto const& [first, second] : rows) {
        widest = std::max(widest, std::min(columnsOf(first), widestFirst));
    }
    std::size_t const column = indent + widest + 2;
    for (auto const& [first, second] : rows) {
        std::size_t const length = columnsOf(first);
        out += std::string(indent, ' ') + first;
        out += length > widest ? '\n' + std::string(column, ' ') : std::string(column - indent - length, ' ');
        appendWrapped(out, second, column, column);
    }
}

std::string firstColumnOf(OptionDescription const& option) {
    std::string result;
    for (auto const& name : option.names) {
        result += (result.empty() ? "" : ", ") + name;
    }
    return result + (option.value.empty() ? "" : ' ' + option.value);
}

void appendOptions(std::string& out, std::string const& heading,
                   std::vector<OptionDescription> const& options) {
    Rows rows;
    for (auto const& option : options) {
        rows.emplace_back(firstColumnOf(option), option.text);
    }
    if (!rows.empty()) {
        appendHeading(out, heading);
        appendRows(out, rows);
    }
}

/// The verbs under the heading of their purpose, which is the same for neighbours.
void appendMembers(std::string& out, std::vector<VerbDescription> const& members) {
    for (auto member = members.begin(); member != members.end();) {
        auto const end = std::find_if(member, members.end(),
                                      [&](auto const& other) { return other.purpose != member->purpose; });
        appendHeading(out, member->purpose);
        Rows rows;
        for (; member != end; ++member) {
            rows.emplace_back(member->name.substr(member->name.rfind(' ') + 1), member->summary);
        }
        appendRows(out, rows);
    }
}

void appendExitCodes(std::string& out) {
    Rows rows;
    for (auto const& [code, text] : describeExitCodes()) {
        rows.emplace_back(code, text);
    }
    appendHeading(out, "HelpExitCodes");
    appendRows(out, rows);
}

} // namespace

std::string helpOf(VerbDescription const& verb) {
    std::string out;
    appendWrapped(out, verb.summary + '.' + (verb.details.empty() ? "" : ' ' + verb.details), 0, 0);
    out += '\n';
    auto const usage = Message("HelpUsage").text() + ':';
    out += colored(Color::Heading, usage) + ' ';
    appendWrapped(out, verb.usage(), columnsOf(usage) + 1, columnsOf(usage) + 1);
    appendMembers(out, verb.members);
    appendOptions(out, "HelpArguments", verb.arguments);
    appendOptions(out, "HelpOptionsHeading", verb.options);
    if (!verb.example.empty()) {
        appendHeading(out, "HelpExample");
        out += "  $ " + verb.example + '\n';
    }
    if (verb.name.empty()) {
        appendExitCodes(out);
    }
    out += '\n';
    appendWrapped(out, Message(verb.name.empty() ? "HelpOfVerbs" : "HelpCommonOptions").text(), 0, 0);
    return out;
}

std::string HelpFormatter::make_help(CLI::App const* verb, std::string /*name*/,
                                     CLI::AppFormatMode /*mode*/) const {
    return helpOf(describe(*verb));
}

} // namespace projectctl

#include "cli/TextArguments.hpp"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <string_view>

namespace projectctl {

namespace {

// An argument can be any name, but the parser interprets some of them: it splits "[a,b]" as a list, "++" ends
// a command, and after "--" it still reads options if an argument came before. A mark in front of such an
// argument prevents this.
constexpr char mark = '\x01';

bool isSpecial(std::string_view text) {
    return text.starts_with('[') || text == "++";
}

/// The text without the marks at its beginning.
std::string_view behindMarks(std::string_view text) {
    return text.substr(std::min(text.find_first_not_of(mark), text.size()));
}

} // namespace

CLI::Option* takeText(CLI::App& app, std::string const& name, std::optional<std::string>& value,
                      std::string const& description) {
    auto const take = [&value](CLI::results_t const& given) {
        value = unmarked(given.front());
        return true;
    };
    return app.add_option(name, take, description);
}

CLI::Option* takeTexts(CLI::App& app, std::string const& name, std::vector<std::string>& values,
                       std::string const& description) {
    auto const take = [&values](CLI::results_t const& given) {
        std::ranges::transform(given, std::back_inserter(values), unmarked);
        return true;
    };
    return app.add_option(name, take, description)->expected(CLI::detail::expected_max_vector_size);
}

std::vector<std::string> markedArguments(std::vector<std::string> const& given) {
    std::vector<std::string> result;
    bool optionsEnded = false;
    for (std::string_view const argument : given) {
        if (argument == "--" && !optionsEnded) {
            optionsEnded = true;
            continue;
        }
        std::string_view const rest = behindMarks(argument);
        bool const isDashed = rest.starts_with('-') && (optionsEnded || rest.size() < argument.size());
        result.push_back((isSpecial(rest) || isDashed ? std::string(1, mark) : std::string()) +
                         std::string(argument));
    }
    return result;
}

std::string unmarked(std::string const& argument) {
    std::string_view const rest = behindMarks(argument);
    bool const isMarked = rest.size() < argument.size() && (isSpecial(rest) || rest.starts_with('-'));
    return isMarked ? argument.substr(1) : argument;
}

std::string withoutMarks(std::string text) {
    std::erase(text, mark);
    return text;
}

} // namespace projectctl

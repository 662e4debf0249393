#pragma once

#include <map>
#include <regex>
#include <set>

#include "tools/ToolTest.hpp"

namespace project::test {

/// The texts of a source of a catalog by their keys. Each text is on one line.
inline std::map<std::string, std::string> readTexts(std::string const& catalog, std::string const& language) {
    auto const folder = std::filesystem::path(PROJECTCTL_SOURCES) / "texts" / catalog;
    std::ifstream file(folder / (language + ".txt"));
    static std::regex const entry(R"re(^    (?:"([^"]+)"|(\w+)) \{ "(.*)" \}$)re");
    std::map<std::string, std::string> result;
    int lines = 0;
    for (std::string line; std::getline(file, line);) {
        std::smatch found;
        if (std::regex_match(line, found, entry)) {
            EXPECT_TRUE(result.emplace(found[1].str() + found[2].str(), found[3]).second) << line;
        }
        lines += line.starts_with("    ") && !line.starts_with("    //") ? 1 : 0;
    }
    EXPECT_EQ(lines, static_cast<int>(result.size())) << catalog << ' ' << language;
    return result;
}

/// The numbers of the arguments of a text.
inline std::set<std::string> argumentsOf(std::string const& text) {
    static std::regex const argument(R"(\{(\d+))");
    return {std::sregex_token_iterator(text.begin(), text.end(), argument, 1), std::sregex_token_iterator()};
}

} // namespace project::test

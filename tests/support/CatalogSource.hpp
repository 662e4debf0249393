#pragma once

#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <regex>
#include <set>
#include <string>

#include <gtest/gtest.h>

namespace project::test {

/// The texts of a catalog's source by their names. Each text is on one line.
inline std::map<std::string, std::string> readCatalog(std::filesystem::path const& source) {
    std::ifstream file(source);
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
    EXPECT_EQ(lines, static_cast<int>(result.size())) << source;
    return result;
}

/// The sources below a folder, by their paths.
inline std::map<std::string, std::string> sourcesBelow(std::filesystem::path const& folder) {
    std::map<std::string, std::string> result;
    for (auto const& entry : std::filesystem::recursive_directory_iterator(folder)) {
        if (entry.path().extension() == ".cpp" || entry.path().extension() == ".hpp") {
            std::ifstream file(entry.path(), std::ios::binary);
            result[entry.path().lexically_relative(folder).string()] = {std::istreambuf_iterator<char>(file),
                                                                        {}};
        }
    }
    return result;
}

inline std::string withoutComments(std::string const& source) {
    static std::regex const comment(R"(//[^\n]*)");
    return std::regex_replace(source, comment, "");
}

/// The first groups of all matches.
inline std::set<std::string> matchesIn(std::string const& text, std::regex const& expression) {
    return {std::sregex_token_iterator(text.begin(), text.end(), expression, 1),
            std::sregex_token_iterator()};
}

/// The numbers of the arguments of a text.
inline std::set<std::string> argumentsOf(std::string const& text) {
    static std::regex const argument(R"(\{(\d+))");
    return matchesIn(text, argument);
}

} // namespace project::test

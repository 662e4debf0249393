#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <regex>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

namespace project::test {

/// Compares JSON documents with files that never change: a document of another form needs a new version.
///
/// With PROJECT_WRITE_GOLDEN in the environment, missing files are written.
class GoldenDocument {
public:
    /// @param varying texts that differ in each run, each with the text that takes its place. UUIDs differ,
    ///        too, and sentences are for people.
    explicit GoldenDocument(std::vector<std::pair<std::string, std::string>> varying)
        : varying_(std::move(varying)) {}

    /// Compares a document, or a sequence of lines that begins with one, with the file of its format and
    /// version.
    void expect(std::string const& document) const {
        static std::regex const head(R"re("format": "([a-z-]+)", "version": (\d+))re");
        std::smatch found;
        ASSERT_TRUE(std::regex_search(document, found, head)) << document;
        auto const name = found[1].str() + '-' + found[2].str() + ".json";
        auto const file = std::filesystem::path(GOLDEN_JSON) / name;
        auto const text = normalised(document);
        if (!std::filesystem::exists(file) && std::getenv("PROJECT_WRITE_GOLDEN") != nullptr) {
            std::ofstream(file, std::ios::binary) << text;
        }
        std::ifstream stored(file, std::ios::binary);
        EXPECT_EQ(text, std::string(std::istreambuf_iterator<char>(stored), {}))
            << name << " is another document. If that is intended, give the format a new version.";
    }

private:
    std::string normalised(std::string text) const {
        for (auto const& [from, to] : varying_) {
            for (auto at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size())) {
                text.replace(at, from.size(), to);
            }
        }
        std::map<std::string, std::string> names;
        static std::regex const uuid("[0-9a-f]{8}(-[0-9a-f]{4}){3}-[0-9a-f]{12}");
        for (std::smatch match; std::regex_search(text, match, uuid);) {
            auto const& name = names.emplace(match[0], "UUID-" + std::to_string(names.size())).first->second;
            text = match.prefix().str() + name + match.suffix().str();
        }
        static std::regex const time(R"([0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9:]{8}Z)");
        text = std::regex_replace(text, time, "2000-01-01T00:00:00Z");
        static std::regex const sentence(R"re("(text|summary|details)": "(\\.|[^"\\])*")re");
        return std::regex_replace(text, sentence, R"("$1": "...")");
    }

    std::vector<std::pair<std::string, std::string>> varying_;
};

} // namespace project::test

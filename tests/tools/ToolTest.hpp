#pragma once

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/RunningProgram.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::test {

/// Runs projectctl as a process of its own, in a fresh folder.
class ToolTest : public ::testing::Test {
protected:
    ToolTest() {
        settings_.folder = folder_.onDisk();
        settings_.environment["PROJECTCTL_PAGER"] = "cat"; // a terminal shows the output itself
    }

    /// Calls projectctl with the current settings.
    ProgramResult tool(std::vector<std::string> arguments, std::string_view input = {}) const {
        return validated(arguments, runProgram(commandFor(arguments), settings_, input));
    }

    /// Calls projectctl from a folder below the fresh one.
    ProgramResult toolFrom(std::filesystem::path const& relative, std::vector<std::string> arguments) const {
        auto settings = settings_;
        settings.folder /= relative;
        return validated(arguments, runProgram(commandFor(arguments), settings));
    }

    /// Everything that the tests receive as JSON must follow the schemas of docs/json.
    void TearDown() override { expectValid(documents_); }

    /// Compares JSON documents, one after the other, with their schemas.
    static void expectValid(std::string const& documents) {
        if (!documents.empty()) {
            auto const result = runProgram({VALIDATE_JSON, JSON_SCHEMAS}, {}, documents);
            EXPECT_EQ(result.exitCode, 0) << result.output << result.errors;
        }
    }

    /// The JSON document of a format with one array.
    /// @param rows one object each.
    static std::string document(std::string const& format, std::string const& key,
                                std::vector<std::string> const& rows, int version = 1) {
        std::string result = "{\"format\": \"projectctl-" + format +
                             "\", \"version\": " + std::to_string(version) + ", \"" + key + "\": [";
        for (auto const& row : rows) {
            result += (&row == &rows.front() ? "\n" : ",\n") + row;
        }
        return result + (rows.empty() ? "]}\n" : "\n]}\n");
    }

    static std::vector<std::string> commandFor(std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), PROJECTCTL);
        return arguments;
    }

    /// The lines of `list`.
    std::vector<std::string> list() const { return linesOf(tool({"list"}).output); }

    static std::vector<std::string> linesOf(std::string const& text) {
        std::vector<std::string> result;
        for (std::size_t from = 0; from < text.size();) {
            auto const end = std::min(text.find('\n', from), text.size());
            result.push_back(text.substr(from, end - from));
            from = end + 1;
        }
        return result;
    }

    /// The names, each followed by a zero byte.
    static std::string withZeros(std::vector<std::string> const& names) {
        std::string result;
        for (auto const& name : names) {
            result += name + '\0';
        }
        return result;
    }

    void initProject() const { ASSERT_EQ(tool({"init"}).exitCode, 0); }

    std::filesystem::path text() const { return folder_.onDisk() / ".projectdata" / "project.jsonl"; }

    std::string readText() const {
        std::ifstream file(text(), std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    void writeText(std::string const& content) const {
        std::ofstream(text(), std::ios::binary | std::ios::trunc) << content;
    }

    /// Inserts a line, given without its end, before the first line that begins with the mark.
    void insertLineBefore(std::string const& mark, std::string const& line) const {
        auto content = readText();
        auto const place = content.find('\n' + mark);
        ASSERT_NE(place, std::string::npos) << mark;
        writeText(content.insert(place + 1, line + '\n'));
    }

    /// From now on projectctl runs without root's privileges, so that the permissions of files apply to it.
    void dropPrivileges() { settings_.withoutPrivileges = true; }

    std::string inFolder(std::string const& relative) const { return (folder_.onDisk() / relative).string(); }

    TemporaryFolder folder_;
    ProgramSettings settings_;

private:
    ProgramResult validated(std::vector<std::string> const& arguments, ProgramResult result) const {
        bool const isCompletion = !arguments.empty() && arguments.front() == "__complete";
        if (!isCompletion && std::ranges::count(arguments, "--json") > 0) {
            documents_ += result.output + result.errors;
        }
        return result;
    }

    mutable std::string documents_; ///< in JSON, of all calls
};

/// A run that succeeded without any output.
MATCHER(SucceedsSilently, "") {
    *result_listener << "exit code " << arg.exitCode << ", errors: " << arg.errors
                     << ", output: " << arg.output;
    return arg.exitCode == 0 && arg.output.empty() && arg.errors.empty();
}

/// A run that failed with this exit code and one line of error that contains this text, without other output.
MATCHER_P2(FailsWith, exitCode, text, "") {
    *result_listener << "exit code " << arg.exitCode << ", errors: " << arg.errors
                     << ", output: " << arg.output;
    return arg.exitCode == exitCode && arg.output.empty() && arg.errors.starts_with("projectctl: ") &&
           arg.errors.find('\n') == arg.errors.size() - 1 && arg.errors.find(text) != std::string::npos;
}

/// A run with --json that failed with this exit code and one JSON document on standard error, whose text
/// contains this text.
MATCHER_P2(FailsInJsonWith, exitCode, text, "") {
    *result_listener << "exit code " << arg.exitCode << ", errors: " << arg.errors
                     << ", output: " << arg.output;
    return arg.exitCode == exitCode && arg.output.empty() &&
           arg.errors.starts_with(
               "{\"format\": \"projectctl-message\", \"version\": 1, \"severity\": \"error\"") &&
           arg.errors.find("\"exitCode\": " + std::to_string(exitCode) + ",") != std::string::npos &&
           arg.errors.find('\n') == arg.errors.size() - 1 && arg.errors.find(text) != std::string::npos;
}

/// A run that succeeded with this output and without errors.
MATCHER_P(Prints, output, "") {
    *result_listener << "exit code " << arg.exitCode << ", errors: " << arg.errors
                     << ", output: " << arg.output;
    return arg.exitCode == 0 && arg.errors.empty() && arg.output == output;
}

} // namespace project::test

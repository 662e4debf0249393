#pragma once

#include <regex>

#include "tools/ToolTest.hpp"

namespace project::test {

/// A project with the files "a", "b" and "c", for tests of labels.
class LabelToolTest : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        for (auto const* name : {u"a", u"b", u"c"}) {
            folder_.file(name);
        }
        ASSERT_THAT(tool({"add", "a", "b", "c"}), SucceedsSilently());
    }

    /// Creates a category with one label, and puts the label on a file.
    void createLabelled(std::string const& category, std::string const& label,
                        std::string const& file) const {
        ASSERT_THAT(tool({"category", "create", category}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", category, label}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", category, label, file}), SucceedsSilently());
    }

    std::string categoryUUID(std::string const& name) const {
        return found("\"name\": \"" + name + "\", \"uuid\": \"([^\"]*)\"", {"category", "list", "--json"});
    }

    std::string labelUUID(std::string const& name) const {
        return found("\"label\": \\{\"uuid\": \"([^\"]*)\", \"name\": \"" + name + "\"",
                     {"label", "list", "--json"});
    }

    /// Replaces every occurrence in the project's text. There must be at least one.
    void replaceInText(std::string const& what, std::string const& with) const {
        auto content = readText();
        auto at = content.find(what);
        ASSERT_NE(at, std::string::npos) << what;
        for (; at != std::string::npos; at = content.find(what, at + with.size())) {
            content.replace(at, what.size(), with);
        }
        writeText(content);
    }

private:
    /// The match of the first group of an expression in the output of a command.
    std::string found(std::string const& expression, std::vector<std::string> command) const {
        auto const output = tool(std::move(command)).output;
        std::smatch match;
        EXPECT_TRUE(std::regex_search(output, match, std::regex(expression))) << output;
        return match.empty() ? std::string() : match[1].str();
    }
};

} // namespace project::test

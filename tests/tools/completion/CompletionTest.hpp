#pragma once

#include "tools/ToolTest.hpp"

namespace project::test {

/// A project with names that shells must quote.
class CompletionTest : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        for (auto const* name : {"my dir/it's", "my dir/line\nbreak", "src/a.cpp", "src/b.cpp", "quo\"te"}) {
            folder_.addFile(name);
        }
        ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
        createLabel("Status", "Open");
        createLabel("Status", "Re \"viewed");
        createLabel("My Cat", "one\ntwo");
    }

    /// Creates a label, and its category if that does not exist.
    void createLabel(std::string const& category, std::string const& label) const {
        tool({"category", "create", category});
        ASSERT_THAT(tool({"label", "create", category, label}), SucceedsSilently());
    }

    using Lines = std::vector<std::string>;

    /// Parts of a text that end with a zero byte.
    static Lines partsOf(std::string const& text) {
        Lines result;
        for (std::size_t from = 0; from < text.size();) {
            auto const end = std::min(text.find('\0', from), text.size());
            result.push_back(text.substr(from, end - from));
            from = end + 1;
        }
        return result;
    }

    static Lines valuesOf(Lines const& candidates) {
        Lines result;
        for (auto const& candidate : candidates) {
            result.push_back(candidate.substr(0, candidate.rfind('\t')));
        }
        return result;
    }
};

} // namespace project::test

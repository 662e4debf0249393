#pragma once

#include <string>
#include <vector>

#include "tools/merge/MergingProject.hpp"

namespace project::test {

/// A project with a history: a folder of sources that are labelled, and later renamed.
class HistoryTest : public MergingProject {
protected:
    void SetUp() override {
        MergingProject::SetUp();
        for (auto const* name : {"src/main.cpp", "src/pump.cpp"}) {
            folder_.addFile(name, std::string(name) + "\n1\n2\n3\n4\n5\n");
        }
        ASSERT_THAT(tool({"add", "--recursive", "src"}), SucceedsSilently());
        commit("sources");
        ASSERT_THAT(tool({"label", "put", "Status", "Open", "src/main.cpp"}), SucceedsSilently());
        commit("a label");
    }

    /// Renames src to lib, for git and in the text, as a person does who edits it.
    void renameSources() const {
        git_.run({"mv", "src", "lib"});
        auto content = readText();
        for (auto at = content.find("\"src"); at != std::string::npos; at = content.find("\"src")) {
            content.replace(at + 1, 3, "lib");
        }
        writeText(content);
        ASSERT_THAT(tool({"tidy"}), SucceedsSilently());
        git_.run({"add", "-A"});
    }

    /// The output of a command without the ids and days of commits.
    std::string withoutIds(std::string const& text) const {
        std::string result;
        for (auto const& line : linesOf(text)) {
            constexpr std::size_t idAndDay = 22;
            result += (line.starts_with(' ') ? line : line.substr(std::min(idAndDay, line.size()))) + '\n';
        }
        return result;
    }
};

} // namespace project::test

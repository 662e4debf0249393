#pragma once

#include <string>
#include <vector>

#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {

/// A project in a git repository whose merge driver is the tool under test. The tool is not on the PATH.
class MergingProject : public ToolTest {
protected:
    void SetUp() override {
        settings_.environment["PATH"] = searchPath;
        initProject();
        for (auto const* name : {u"a", u"b", u"c"}) {
            folder_.file(name);
        }
        ASSERT_THAT(tool({"add", "a", "b", "c"}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Status", "--single-valued"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Done"}), SucceedsSilently());
        commit("the project");
    }

    /// Commits the files that the tool has staged.
    void commit(std::string const& message) const { git_.run({"commit", "-q", "-m", message}); }

    /// Runs one command on a new branch and another one on the main branch, and merges.
    ProgramResult mergeOf(std::vector<std::string> const& theirs,
                          std::vector<std::string> const& ours) const {
        git_.run({"switch", "-q", "-c", "hers"});
        EXPECT_THAT(tool(theirs), SucceedsSilently());
        commit("hers");
        git_.run({"switch", "-q", "-f", "main"});
        EXPECT_THAT(tool(ours), SucceedsSilently());
        commit("his");
        return git_.tryTo({"merge", "-q", "-m", "both", "hers"});
    }

    static constexpr char const* searchPath = "/usr/bin:/bin";
    GitFolder const git_{folder_.onDisk(), {{"PATH", searchPath}}};
};

} // namespace project::test

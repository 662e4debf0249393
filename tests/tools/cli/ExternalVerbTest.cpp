#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

/// With a program projectctl-hello on the PATH.
class ExternalVerb : public ToolTest {
protected:
    ExternalVerb() {
        std::filesystem::create_directory(inFolder("bin"));
        addProgram("projectctl-hello", "#!/bin/sh\nprintf '<%s>' \"$@\"; pwd; exit 5\n");
        settings_.environment["PATH"] = inFolder("bin") + ":/usr/bin:/bin";
    }

    void addProgram(std::string const& name, std::string const& content) const {
        auto const path = folder_.onDisk() / "bin" / name;
        std::ofstream(path) << content;
        std::filesystem::permissions(path, std::filesystem::perms::owner_all);
    }
};

TEST_F(ExternalVerb, isTheProgramOfItsName) {
    auto const result = tool({"hello", "a b", "--full-name", "-C", "--", "[c,d]"});

    EXPECT_EQ(result.exitCode, 5);
    EXPECT_EQ(result.output, "<a b><--full-name><-C><--><[c,d]>" + folder_.onDisk().string() + '\n');
}

TEST_F(ExternalVerb, runsInTheChosenFolder) {
    EXPECT_THAT(tool({"-C", "bin", "--full-name", "hello", "x"}).output, HasSubstr("<x>" + inFolder("bin")));
}

TEST_F(ExternalVerb, doesNotReplaceAVerbOfTheTool) {
    addProgram("projectctl-root", "#!/bin/sh\necho replaced\n");
    initProject();

    EXPECT_THAT(tool({"root"}), Prints(folder_.onDisk().string() + '\n'));
}

TEST_F(ExternalVerb, isNeverAPath) {
    std::filesystem::create_directory(inFolder("projectctl-."));
    std::filesystem::copy(inFolder("bin/projectctl-hello"), inFolder("projectctl-./x"));

    EXPECT_THAT(tool({"./x"}), FailsWith(2, "unknown command or option \"./x\""));
}

TEST_F(ExternalVerb, thatDoesNotExistIsAnUnknownVerb) {
    EXPECT_THAT(tool({"helloo"}), FailsWith(2, "unknown command or option \"helloo\""));
}

} // namespace
} // namespace project::test

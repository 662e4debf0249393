#include <csignal>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

/// The reader of a list closes it before its end, as `head` does.
class ClosedOutput : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        std::string const longName(240, 'x');
        for (int number = 0; number < 1000; ++number) { // more than twice the capacity of a pipe
            folder_.addFile("folder/" + longName + std::to_string(number));
        }
        ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    }
};

TEST_F(ClosedOutput, endsTheListWithoutAMessage) {
    for (auto const* form : {"--null", "--json", "--tree"}) {
        RunningProgram listing(commandFor({"list", form}), settings_);
        EXPECT_NE(listing.readAndClose(1), "");

        auto const result = listing.finish();

        EXPECT_EQ(result.signal, SIGPIPE); // like any program whose output was closed
        EXPECT_EQ(result.errors, "");
    }
}

TEST_F(ClosedOutput, isNotAnErrorForAShell) {
    RunningProgram shell({"sh", "-c", PROJECTCTL " list | head -n 1"}, settings_);

    EXPECT_THAT(shell.finish(), Prints("folder\n"));
}

TEST_F(ClosedOutput, endsTheSameWayWhereTheCallerIgnoresTheSignal) {
    RunningProgram shell({"bash", "-c", "trap '' PIPE; " PROJECTCTL " list | true; exit ${PIPESTATUS[0]}"},
                         settings_);

    auto const result = shell.finish();

    EXPECT_EQ(result.exitCode, 141); // ended by the signal
    EXPECT_EQ(result.errors, "");
}

} // namespace
} // namespace project::test

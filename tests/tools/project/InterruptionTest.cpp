#include <csignal>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

/// Ctrl-C, which a terminal sends as SIGINT.
class Interruption : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
    }

    ProgramSettings withOpenInput() const {
        auto settings = settings_;
        settings.inputStaysOpen = true;
        return settings;
    }
};

TEST_F(Interruption, beforeTheWriteChangesNothing) {
    auto const before = readText();
    RunningProgram adding(commandFor({"add", "a", "-"}), withOpenInput());
    ASSERT_TRUE(adding.waitUntilItSleeps()); // for the lines of its input

    adding.sendSignal(SIGINT);

    EXPECT_EQ(adding.finish().signal, SIGINT);
    EXPECT_EQ(readText(), before);
}

TEST_F(Interruption, endsTheWaitForAnotherWriterAtOnce) {
    auto const before = readText();
    RunningProgram holder({"flock", ".projectdata", "sh", "-c", "read line"}, withOpenInput());
    ASSERT_TRUE(holder.waitUntilItSleeps());
    RunningProgram adding(commandFor({"add", "a"}), settings_);
    ASSERT_TRUE(adding.waitUntilItSleeps());

    adding.sendSignal(SIGINT);

    EXPECT_EQ(adding.finish().signal, SIGINT);
    EXPECT_EQ(readText(), before);
    EXPECT_EQ(holder.finish("\n").exitCode, 0);
    EXPECT_THAT(tool({"add", "a"}), SucceedsSilently());
}

TEST_F(Interruption, atAnyMomentLeavesAllOrNothing) {
    for (int number = 0; number < 500; ++number) {
        folder_.addFile("folder/file" + std::to_string(number));
    }
    for (useconds_t wait = 0; wait < 30'000; wait += 1'000) {
        RunningProgram adding(commandFor({"add", "-r", "folder"}), settings_);
        usleep(wait);
        adding.sendSignal(SIGINT);
        adding.finish();

        auto const listed = list().size();

        EXPECT_TRUE(listed == 0 || listed == 501) << listed << " files after " << wait << " microseconds";
        EXPECT_THAT(tool({"check"}), SucceedsSilently());
        if (listed > 0) {
            return; // from here on there is nothing left to add
        }
    }
}

} // namespace
} // namespace project::test

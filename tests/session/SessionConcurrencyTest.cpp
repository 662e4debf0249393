#include <atomic>
#include <fstream>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/RunningProgram.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

std::string git(test::TemporaryFolder const& folder, std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "git");
    test::ProgramSettings settings;
    settings.folder = folder.onDisk();
    auto const result = test::runProgram(arguments, settings);
    EXPECT_EQ(result.exitCode, 0) << result.errors;
    return result.output;
}

TEST(SessionConcurrency, threadsThatChangeTheProjectStageWhatTheLastOfThemWrote) {
    constexpr int changes = 30;
    test::TemporaryFolder const folder;
    git(folder, {"init", "-q", "."});
    auto session = Session::make(folder.root(), u"Engine");
    auto& project = session.project();
    auto const file = folder.file(u"a");
    project.getFileManager().add({file});
    std::atomic<int> events = 0;
    session.events()->onNameChanged([&events] { ++events; });

    std::thread naming([&] {
        for (int number = 0; number < changes; ++number) {
            project.setName(number % 2 == 0 ? u"Pump" : u"Valve");
        }
    });
    std::thread describing([&] {
        for (int number = 0; number < changes; ++number) {
            project.setDescription(number % 2 == 0 ? u"one" : u"two");
        }
    });
    std::thread reading([&] {
        for (int number = 0; number < changes; ++number) {
            EXPECT_TRUE(project.getFileManager().isFileInProject(file));
            EXPECT_FALSE(project.getName().empty());
        }
    });
    naming.join();
    describing.join();
    reading.join();

    EXPECT_EQ(events, changes);
    std::ifstream text(folder.onDisk() / ".projectdata" / "project.jsonl", std::ios::binary);
    std::string const onDisk{std::istreambuf_iterator<char>(text), {}};
    EXPECT_EQ(git(folder, {"show", ":.projectdata/project.jsonl"}), onDisk);
    EXPECT_THAT(onDisk, ::testing::AllOf(::testing::HasSubstr("Valve"), ::testing::HasSubstr("two")));
}

} // namespace
} // namespace project::session

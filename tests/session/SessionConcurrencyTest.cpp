#include <atomic>
#include <fstream>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

TEST(SessionConcurrency, threadsThatChangeTheProjectStageWhatTheLastOfThemWrote) {
    constexpr int changes = 30;
    test::TemporaryFolder const folder;
    test::GitFolder const git(folder.onDisk());
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
    EXPECT_EQ(git.run({"show", ":.projectdata/project.jsonl"}), onDisk);
    EXPECT_THAT(onDisk, ::testing::AllOf(::testing::HasSubstr("Valve"), ::testing::HasSubstr("two")));
}

} // namespace
} // namespace project::session

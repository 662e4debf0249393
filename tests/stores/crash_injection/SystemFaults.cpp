#include "SystemFaults.hpp"

#include <cstdlib>
#include <filesystem>
#include <set>
#include <system_error>

using testing::Contains;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

namespace project::test {

void SystemFaults::SetUpTestSuite() {
    if (std::filesystem::is_directory("/dev/shm")) {
        ::setenv("TMPDIR", "/dev/shm", 0);
    }
}

std::optional<StoreError> SystemFaults::perform(SystemOperation const& operation, RealProject& project,
                                                SystemCalls::Answer const& answer) {
    SystemCalls const calls(answer);
    try {
        operation.perform(project);
    } catch (StoreError const& error) {
        return error;
    }
    return std::nullopt;
}

bool SystemFaults::failAt(SystemOperation const& operation, std::size_t callsBefore, int error,
                          bool isForGood, SystemCalls::Answer const& system) {
    auto const project = projectFor(operation);
    std::size_t count = 0;
    std::string failed;
    auto const thrown = perform(operation, *project, [&](SystemCall const& call) {
        bool const isHit = count == callsBefore || (isForGood && count > callsBefore);
        ++count;
        if (isHit && failed.empty()) {
            failed = call.name;
        }
        return isHit ? error : system ? system(call) : 0;
    });
    SCOPED_TRACE(std::string(operation.name) + ": " + std::generic_category().message(error) +
                 (isForGood ? " from call " : " at call ") + std::to_string(callsBefore) + ", " + failed);
    if (thrown) {
        EXPECT_FALSE(failed.empty()) << thrown->what();
        EXPECT_THAT(thrown->file(), StartsWith(project->root.onDisk().string())) << thrown->what();
        EXPECT_THAT(thrown->remedy(), Not(IsEmpty())) << thrown->what();
    }
    checkAfterwards(operation, *project, thrown);
    if (!failed.empty()) {
        ++hits[failed];
    }
    return !failed.empty();
}

void SystemFaults::checkAfterwards(SystemOperation const& operation, RealProject& project,
                                   std::optional<StoreError> const& error) {
    SystemCalls const withoutSyncs;
    auto const found = contentOf(*project.open(operation.options));
    if (error && error->kind() == StoreError::Kind::OutcomeUnknown) {
        EXPECT_THAT((std::vector<Content>{operation.before, operation.after}), Contains(found));
    } else {
        EXPECT_EQ(error ? operation.before : operation.after, found) << (error ? error->what() : "no error");
    }
    if (project.backend) {
        EXPECT_EQ(found, contentOf(*project.backend));
    }
    project.backend.reset();
    checkNextWriter(operation, project, found);
}

void SystemFaults::checkNextWriter(SystemOperation const& operation, RealProject const& project,
                                   Content const& found) {
    auto const writer = project.open(operation.options);
    std::set<std::string> allowed{".gitattributes", ".gitignore", "project.jsonl"};
    for (auto const& fault : writer->check()) {
        if (fault.kind == stores::Fault::Kind::Damage) {
            EXPECT_NE(std::string::npos, project.text().find("\"a name without its end\n"));
            writer->repair();
        } else if (fault.kind == stores::Fault::Kind::Conflict) {
            writer->resolve(textOf(addFiles(manyFiles(20))));
        }
    }
    auto const before = contentOf(*writer);
    commit(*writer, addFiles({u"z"}));
    auto after = before;
    after.insert(*contentAfter({addFiles({u"z"})}).begin());
    EXPECT_EQ(after, contentOf(*project.open(operation.options)));
    EXPECT_TRUE(before == found || operation.name == std::string("resolve"));
    for (auto const& name : project.names()) {
        EXPECT_TRUE(allowed.contains(name) || name.starts_with("damaged-")) << name << " was left";
    }
}

} // namespace project::test

#include "project/stores/SystemDisk.hpp"
#include "support/RandomProcesses.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

namespace project::test {

namespace {

using namespace std::chrono_literals;

/// Processes on a text in a folder of the disk.
class RandomOperations : public testing::Test {
protected:
    RandomOperations() {
        TextBackend backend(stores::makeSystemDisk(root.path(), TextBackend::folderName));
        commit(backend, addFiles(manyFiles(100)));
    }

    /// Some processes append each batch, some rewrite the text.
    std::unique_ptr<Backend> open(std::mt19937& random) const {
        auto const options =
            random() % 3 > 0
                ? TextBackend::Options{.patience = 60s, .alwaysRewritten = 0, .bodyToTail = 1}
                : TextBackend::Options{.patience = 60s, .alwaysRewritten = 1U << 20U, .bodyToTail = 16};
        return std::make_unique<TextBackend>(stores::makeSystemDisk(root.path(), TextBackend::folderName),
                                             options);
    }

    TemporaryFolder root;
    RandomProcesses processes{{.open = [this](std::size_t, std::mt19937& random) { return open(random); },
                               .tidy = [](Backend& backend) { dynamic_cast<TextBackend&>(backend).tidy(); }}};
};

TEST_F(RandomOperations, ofManyProcessesAreLinearizable) {
    processes.runFor(1000ms, RandomProcesses::Deaths::None);
    EXPECT_GT(processes.operations(), 100U);
}

TEST_F(RandomOperations, ofProcessesThatDieAreLinearizable) {
    processes.runFor(1000ms, RandomProcesses::Deaths::Some);
    EXPECT_GT(processes.operations(), 100U);
    EXPECT_GT(processes.deaths(), 0U);
}

} // namespace

} // namespace project::test

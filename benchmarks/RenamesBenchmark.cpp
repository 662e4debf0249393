#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <stdexcept>
#include <string>

#include <benchmark/benchmark.h>

#include "Process.hpp"

// 10,000 files that were moved to other folders since the last commit, and of which a tenth was edited.

namespace project::benchmarks {
namespace {

namespace files = std::filesystem;

class MovedFiles {
public:
    static MovedFiles const& get() {
        static MovedFiles const result;
        return result;
    }

    ~MovedFiles() {
        std::error_code ignored;
        files::remove_all(root_, ignored);
    }

    MovedFiles(MovedFiles const&) = delete;
    MovedFiles& operator=(MovedFiles const&) = delete;

    files::path const& onDisk() const { return root_; }

private:
    static constexpr int count = 10000;

    MovedFiles() {
        auto pattern = (files::temp_directory_path() / "project-benchmark-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error("no temporary folder could be created");
        }
        root_ = pattern;
        runSilently(root_, {"git", "init", "-q"});
        for (int number = 0; number < count; ++number) {
            files::create_directories(oldPlace(number).parent_path());
            write(number);
        }
        runSilently(root_, {PROJECTCTL, "init"});
        runSilently(root_, {PROJECTCTL, "add", "--recursive", "old"});
        runSilently(root_,
                    {"git", "-c", "user.name=B", "-c", "user.email=b@example.org", "commit", "-qm", "first"});
        for (int number = 0; number < count; ++number) {
            files::create_directories(newPlace(number).parent_path());
            files::rename(oldPlace(number), newPlace(number));
            if (number % 10 == 0) {
                std::ofstream(newPlace(number), std::ios::app) << "// edited\n";
            }
        }
        files::remove_all(root_ / "old");
    }

    void write(int number) {
        std::ofstream file(oldPlace(number));
        for (int line = 0; line < 60; ++line) {
            file << "int value" << random_() << " = " << random_() << ";\n";
        }
    }

    files::path oldPlace(int number) const {
        return root_ / "old" / std::to_string(number % 100) / ("file" + std::to_string(number) + ".c");
    }

    files::path newPlace(int number) const {
        return root_ / "new" / std::to_string(number % 90) / ("file" + std::to_string(number) + ".c");
    }

    files::path root_;
    std::mt19937 random_; // NOLINT(cert-msc32-c,cert-msc51-cpp): the same files in each run
};

void renamesOfProject(benchmark::State& state) {
    auto const& folder = MovedFiles::get().onDisk();
    for (auto _ : state) {
        runSilently(folder, {PROJECTCTL, "status", "--renames"});
    }
}

/// With an index of its own, so that the next run finds the same state.
void renamesOfGit(benchmark::State& state) {
    auto const& folder = MovedFiles::get().onDisk();
    for (auto _ : state) {
        runSilently(folder, {"sh", "-c",
                             "cp .git/index .git/other && export GIT_INDEX_FILE=.git/other && git add -A && "
                             "git diff --cached --raw -M -l0"});
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(3)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("renames/projectctl", renamesOfProject));
    repeat(benchmark::RegisterBenchmark("renames/git", renamesOfGit));
    return true;
}();

} // namespace
} // namespace project::benchmarks

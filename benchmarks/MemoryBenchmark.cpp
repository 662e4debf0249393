#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

#include "project/core/FileManager.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

// The memory of a project: how much a process grows when it has opened the project and queried all files, as
// a multiple of the text, and how much it grows at most while it adds all files, as a multiple of their
// paths.
//
//   project_memory_benchmark [FILES...]     by default 10,000, 100,000 and 1,000,000

namespace {

using fl::filesystem::Path;
using project::stores::TextBackend;

constexpr std::size_t filesInAFolder = 20;
constexpr std::size_t foldersInAFolder = 50;
constexpr double kibibyte = 1024;

/// A value of this process in KiB, from the kernel's list: VmRSS now, or VmHWM at most.
std::size_t memory(std::string const& name) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.starts_with(name + ':')) {
            return std::stoul(line.substr(name.size() + 1));
        }
    }
    throw std::runtime_error("the kernel does not list " + name);
}

void resetPeak() {
    std::ofstream("/proc/self/clear_refs") << '5';
}

/// Runs a measurement in a process of its own, whose heap no other measurement has used.
void inAProcess(std::function<void()> const& measure) {
    std::fflush(nullptr);
    if (auto const child = fork(); child != 0) {
        int status = 0;
        if (child < 0 || waitpid(child, &status, 0) != child || status != 0) {
            throw std::runtime_error("a measurement failed");
        }
        return;
    }
    measure();
    std::fflush(nullptr);
    _exit(0);
}

class Project {
public:
    explicit Project(std::filesystem::path const& folder)
        : root_(fl::filesystem::fromSystem(folder)),
          manager_(root_, std::make_shared<project::stores::TreeMetadataManager>(
                              std::make_unique<TextBackend>(
                                  project::stores::makeSystemDisk(root_, TextBackend::folderName)),
                              root_ / Path(TextBackend::folderName))) {}

    project::management::FileManager& files() { return manager_.getFileManager(); }

private:
    Path root_;
    project::management::ProjectManagerBase manager_;
};

std::filesystem::path nameOf(std::size_t number) {
    auto const folder = number / filesInAFolder;
    return std::filesystem::path("m" + std::to_string(folder / foldersInAFolder)) /
           ("c" + std::to_string(folder)) / ("f" + std::to_string(number) + ".cpp");
}

/// Creates the files on disk, and returns them.
std::vector<std::filesystem::path> createFiles(std::filesystem::path const& folder, std::size_t count) {
    std::vector<std::filesystem::path> files;
    files.reserve(count);
    for (std::size_t number = 0; number < count; ++number) {
        files.push_back(folder / nameOf(number));
        if (number % filesInAFolder == 0) {
            std::filesystem::create_directories(files.back().parent_path());
        }
        std::ofstream(files.back()).flush();
    }
    return files;
}

void print(std::size_t count, char const* work, std::size_t grown, double bytes, char const* of) {
    std::printf("%10zu files, %-46s %9zu KiB, %5.2f times %s\n", count, work, grown,
                static_cast<double>(grown) * kibibyte / bytes, of);
}

void measureAdding(std::filesystem::path const& folder, std::size_t count) {
    std::vector<Path> files;
    files.reserve(count);
    std::size_t bytes = 0; // all names are ASCII
    for (std::size_t number = 0; number < count; ++number) {
        files.push_back(fl::filesystem::fromSystem(folder / nameOf(number)));
        bytes += files.back().native().size();
    }
    Project project(folder);
    resetPeak();
    auto const before = memory("VmRSS");
    project.files().add(files);
    print(count, "adding them, at most", memory("VmHWM") - before, static_cast<double>(bytes), "the paths");
}

/// The growth includes the text and the tree. A list of all files is measured after that: the heap keeps most
/// of its pages when it has been deleted, until malloc_trim returns them.
void measureOpened(std::filesystem::path const& folder, std::size_t count) {
    auto const text =
        static_cast<double>(std::filesystem::file_size(folder / ".projectdata" / "project.jsonl"));
    Project project(folder);
    auto const before = memory("VmRSS");
    for (std::size_t number = 0; number < count; ++number) {
        if (!project.files().isFileInProject(fl::filesystem::fromSystem(folder / nameOf(number)))) {
            throw std::runtime_error("a file is missing");
        }
    }
    print(count, "opened, each queried", memory("VmRSS") - before, text, "the text");
    if (project.files().getProjectFiles().size() < count) {
        throw std::runtime_error("files are missing");
    }
    print(count, "then listed, the list deleted", memory("VmRSS") - before, text, "the text");
    malloc_trim(0);
    print(count, "then the heap's free pages returned", memory("VmRSS") - before, text, "the text");
}

void measure(std::size_t count) {
    auto pattern = (std::filesystem::temp_directory_path() / "project-memory-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a temporary folder at " + pattern);
    }
    auto const folder = std::filesystem::canonical(pattern);
    inAProcess([&] { createFiles(folder, count); });
    inAProcess([&] { measureAdding(folder, count); });
    inAProcess([&] { measureOpened(folder, count); });
    std::filesystem::remove_all(folder);
}

} // namespace

int main(int argc, char** argv) {
    std::vector<std::size_t> counts;
    for (int i = 1; i < argc; ++i) {
        counts.push_back(std::stoul(argv[i]));
    }
    if (counts.empty()) {
        counts = {10'000, 100'000, 1'000'000};
    }
    for (auto const count : counts) {
        measure(count);
    }
    return 0;
}

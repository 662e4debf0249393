#include "GeneratedTree.hpp"

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <stdexcept>

#include "Process.hpp"
#include "project/core/FileManager.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::benchmarks {

namespace {

constexpr std::size_t filesInAFolder = 20;
constexpr std::size_t foldersInAFolder = 50;

std::string folderName(std::size_t number) {
    return "module" + std::to_string(number / foldersInAFolder) + "/component" + std::to_string(number);
}

} // namespace

GeneratedTree::GeneratedTree(std::size_t files) {
    auto pattern = (std::filesystem::temp_directory_path() / "project-benchmark-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a temporary folder at " + pattern);
    }
    root_ = std::filesystem::canonical(pattern);
    rootPath_ = fl::filesystem::fromSystem(root_);
    std::fprintf(stderr, "creating %zu files in %s\n", files, root_.c_str());
    for (std::size_t made = 0; made < files; ++made) {
        auto const folder = root_ / folderName(made / filesInAFolder);
        if (made % filesInAFolder == 0) {
            std::filesystem::create_directories(folder);
        }
        auto const file = folder / ("source_file_" + std::to_string(made) + ".cpp");
        std::ofstream(file).flush();
        files_.push_back(fl::filesystem::fromSystem(file));
    }
}

GeneratedTree::~GeneratedTree() {
    std::error_code ignored;
    std::filesystem::remove_all(root_, ignored);
}

GeneratedTree const& GeneratedTree::large() {
    static GeneratedTree const tree(100'000);
    return tree;
}

fl::filesystem::Path GeneratedTree::createFile(std::string const& name) const {
    auto const file = root_ / folderName(0) / name;
    std::ofstream(file).flush();
    return fl::filesystem::fromSystem(file);
}

std::unique_ptr<management::ProjectManager> GeneratedTree::openProject() const {
    auto backend = std::make_unique<stores::TextBackend>(
        stores::makeSystemDisk(rootPath_, stores::TextBackend::folderName));
    auto store = std::make_shared<stores::TreeMetadataManager>(
        std::move(backend), rootPath_ / fl::filesystem::Path(stores::TextBackend::folderName));
    return std::make_unique<management::ProjectManagerBase>(rootPath_, std::move(store));
}

void GeneratedTree::removeProject() const {
    std::filesystem::remove_all(root_ / ".projectdata");
}

void GeneratedTree::fillProject() const {
    auto const project = openProject();
    if (!project->getFileManager().isFileInProject(files_.back())) {
        project->getFileManager().add(files_);
    }
}

void GeneratedTree::fillRepository() const {
    if (std::filesystem::exists(root_ / ".git")) {
        return;
    }
    runSilently(root_, {"git", "init", "-q"});
    runSilently(root_, {"git", "add", "--all", "--", ".", ":!.projectdata"});
}

} // namespace project::benchmarks

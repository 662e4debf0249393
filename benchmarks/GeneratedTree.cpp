#include "GeneratedTree.hpp"

#include <algorithm>
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

constexpr std::size_t deepest = 100;

std::filesystem::path nameOf(std::size_t file) {
    return "source_file_" + std::to_string(file) + ".cpp";
}

/// The files below /usr, relative to it, folder by folder.
std::vector<std::filesystem::path> const& filesOfThisMachine() {
    static std::vector<std::filesystem::path> const files = [] {
        std::filesystem::path const top("/usr");
        std::vector<std::filesystem::path> found;
        auto const options = std::filesystem::directory_options::skip_permission_denied;
        for (auto const& entry : std::filesystem::recursive_directory_iterator(top, options)) {
            if (entry.is_regular_file() && !entry.is_symlink()) {
                found.push_back(entry.path().lexically_relative(top));
            }
        }
        std::ranges::sort(found);
        return found;
    }();
    return files;
}

std::filesystem::path pathOf(std::size_t file, std::size_t files, GeneratedTree::Shape shape) {
    switch (shape) {
    case GeneratedTree::Shape::Wide: {
        auto const folder = file / filesInAFolder;
        return std::filesystem::path("module" + std::to_string(folder / foldersInAFolder)) /
               ("component" + std::to_string(folder)) / nameOf(file);
    }
    case GeneratedTree::Shape::Flat:
        return "folder" / nameOf(file);
    case GeneratedTree::Shape::Deep: {
        std::filesystem::path result = "level";
        for (auto depth = file * deepest / files; depth > 0; --depth) {
            result /= "level";
        }
        return result / nameOf(file);
    }
    case GeneratedTree::Shape::Real: {
        auto const& names = filesOfThisMachine();
        return std::filesystem::path("copy" + std::to_string(file / names.size())) /
               names[file % names.size()];
    }
    }
    return {};
}

} // namespace

GeneratedTree::GeneratedTree(std::size_t files, Shape shape) {
    auto pattern = (std::filesystem::temp_directory_path() / "project-benchmark-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a temporary folder at " + pattern);
    }
    root_ = std::filesystem::canonical(pattern);
    rootPath_ = fl::filesystem::fromSystem(root_);
    std::fprintf(stderr, "creating %zu files in %s\n", files, root_.c_str());
    std::filesystem::path lastFolder;
    for (std::size_t made = 0; made < files; ++made) {
        auto const file = root_ / pathOf(made, files, shape);
        if (file.parent_path() != lastFolder) {
            lastFolder = file.parent_path();
            std::filesystem::create_directories(lastFolder);
        }
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
    auto const file = fl::filesystem::toSystem(files_.front()).parent_path() / name;
    std::ofstream(file).flush();
    return fl::filesystem::fromSystem(file);
}

std::shared_ptr<stores::TreeMetadataManager> GeneratedTree::openStore() const {
    auto backend = std::make_unique<stores::TextBackend>(
        stores::makeSystemDisk(rootPath_, stores::TextBackend::folderName));
    return std::make_shared<stores::TreeMetadataManager>(
        std::move(backend), rootPath_ / fl::filesystem::Path(stores::TextBackend::folderName));
}

std::unique_ptr<management::ProjectManager> GeneratedTree::openProject() const {
    return std::make_unique<management::ProjectManagerBase>(rootPath_, openStore());
}

std::filesystem::path GeneratedTree::text() const {
    return fl::filesystem::toSystem(stores::TextBackend::textPath(rootPath_));
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

// A project whose definition is in an SQLite database: opens it, or creates it, adds files, and lists all
// files.
#include <exception>
#include <iostream>
#include <memory>
#include <span>
#include <vector>

#include <project/management.hpp>
#include <project/stores/TreeMetadataManager.hpp>

#include "SqliteBackend.hpp"

namespace {

using fl::filesystem::Path;
using project::management::ProjectManagerBase;
using project::stores::TreeMetadataManager;

std::shared_ptr<TreeMetadataManager> openStore(Path const& root) {
    auto const folder = root / u".sqliteproject";
    return std::make_shared<TreeMetadataManager>(std::make_unique<sqlite_store::SqliteBackend>(folder),
                                                 folder);
}

void createIfNew(ProjectManagerBase& project) {
    if (project.getName().empty()) {
        project.create(u"A project in a database");
    }
}

std::vector<Path> canonicalPaths(std::span<char* const> names) {
    std::vector<Path> paths;
    for (char const* const name : names) {
        paths.push_back(fl::filesystem::canonical(fl::filesystem::fromSystem(name), Path()));
    }
    return paths;
}

void printFiles(ProjectManagerBase& project) {
    for (auto const& path : project.getFileManager().getProjectFiles()) {
        std::cout << fl::filesystem::toSystem(path).string() << '\n';
    }
}

} // namespace

int main(int argc, char** argv) {
    std::span const arguments(argv, static_cast<std::size_t>(argc));
    if (arguments.size() < 2) {
        std::cerr << "usage: sqlite_project FOLDER [FILE...]\n";
        return 2;
    }
    try {
        auto const root = canonicalPaths(arguments.subspan(1, 1)).front();
        ProjectManagerBase project(root, openStore(root));
        createIfNew(project);
        if (arguments.size() > 2) {
            project.getFileManager().add(canonicalPaths(arguments.subspan(2)));
        }
        printFiles(project);
        return 0;
    } catch (std::exception const& error) {
        std::cerr << "sqlite_project: " << error.what() << '\n';
        return 1;
    }
}

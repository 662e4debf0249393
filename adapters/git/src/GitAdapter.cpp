#include "project/git/GitAdapter.hpp"

#include "index/Staging.hpp"
#include "repository/RepositoryFinder.hpp"
#include "repository/TrackedFiles.hpp"
#include "states/StateQuery.hpp"

namespace project::git {

GitAdapter::GitAdapter(Path const& root, GitEnvironment environment)
    : finder_(std::make_unique<RepositoryFinder>(root, environment)) {
}

GitAdapter::~GitAdapter() = default;

void GitAdapter::addToSourceControl(std::vector<Path> const& files) {
    auto* const repository = files.empty() ? nullptr : finder_->find();
    if (repository != nullptr) {
        Staging(*repository).add(files);
    }
}

void GitAdapter::removeFromSourceControl(std::vector<Path> const& files) {
    auto* const repository = files.empty() ? nullptr : finder_->find();
    if (repository != nullptr) {
        Staging(*repository).remove(files);
    }
}

std::map<fl::filesystem::Path, cmlink::FileState> GitAdapter::getFileStates(std::vector<Path> const& files) {
    std::map<Path, cmlink::FileState> result;
    if (files.empty()) {
        return result;
    }
    auto* const repository = finder_->find();
    if (repository == nullptr) {
        for (auto const& file : files) {
            result.try_emplace(file, cmlink::LocalStatus::NotInRepository);
        }
        return result;
    }
    StateQuery query(*repository);
    for (auto const& file : files) {
        result.try_emplace(file, query.stateOf(file));
    }
    return result;
}

std::set<fl::filesystem::Path> GitAdapter::trackedBelow(std::vector<Path> const& folders) {
    std::set<Path> result;
    auto* const repository = folders.empty() ? nullptr : finder_->find();
    if (repository == nullptr) {
        return result;
    }
    auto* const index = repository->index();
    for (auto const& folder : folders) {
        auto const path = repository->workTree().relativeInProject(folder);
        std::size_t position = path ? firstBelow(index, *path) : git_index_entrycount(index);
        for (; position < git_index_entrycount(index); ++position) {
            std::string const entry = git_index_get_byindex(index, position)->path;
            if (!isBelow(entry.c_str(), *path)) {
                break;
            }
            result.insert(folder /
                          fl::filesystem::fromSystem(entry.substr(path->empty() ? 0 : path->size() + 1)));
        }
    }
    return result;
}

} // namespace project::git

#include "project/git/GitAdapter.hpp"

#include "RepositoryFinder.hpp"
#include "Staging.hpp"
#include "StateQuery.hpp"

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

} // namespace project::git

#include "project/git/GitAdapter.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

#include "index/IndexUpdate.hpp"
#include "index/Staging.hpp"
#include "repository/RepositoryFinder.hpp"
#include "repository/TrackedFiles.hpp"
#include "states/ContentIds.hpp"
#include "states/EarlierContents.hpp"
#include "states/SimilarContents.hpp"
#include "states/StateQuery.hpp"

namespace project::git {

GitAdapter::GitAdapter(Path const& root, GitEnvironment environment)
    : finder_(std::make_unique<RepositoryFinder>(root, environment)) {
}

GitAdapter::~GitAdapter() = default;

/// Runs a change on the staging area of the repository, if there is one. Outside a batch, it is a batch of
/// its own.
template <typename Change>
void GitAdapter::stage(Change const& change) {
    auto* const found = repository();
    if (found == nullptr) {
        return;
    }
    std::unique_ptr<IndexUpdate> own;
    auto& update = isBatchOpen_ ? update_ : own;
    Staging staging(*found, [&]() -> IndexUpdate& {
        if (update == nullptr) {
            update = std::make_unique<IndexUpdate>(*found);
        }
        return *update;
    });
    change(staging);
    if (own != nullptr) {
        own->publish();
    }
}

/// While an update is open, the repository shows its changes.
Repository* GitAdapter::repository() {
    return update_ == nullptr ? finder_->find() : finder_->found();
}

void GitAdapter::addToSourceControl(std::vector<Path> const& files) {
    if (!files.empty()) {
        stage([&files](Staging& staging) { staging.add(files); });
    }
}

void GitAdapter::removeFromSourceControl(std::vector<Path> const& files) {
    if (!files.empty()) {
        stage([&files](Staging& staging) { staging.remove(files); });
    }
}

void GitAdapter::moveInSourceControl(std::vector<FileMove> const& moves) {
    if (!moves.empty()) {
        stage([&moves](Staging& staging) { staging.move(moves); });
    }
}

bool GitAdapter::isTracked(Path const& file) {
    auto* const found = repository();
    auto const path = found == nullptr ? std::nullopt : found->workTree().relativeInProject(file);
    return path && (trackedAt(found->index(), *path) || isAnythingTrackedBelow(found->index(), *path));
}

std::string GitAdapter::indexState() {
    auto* const found = repository();
    if (found == nullptr) {
        return {};
    }
    auto const stamp = FileStamp::of(found->indexFile());
    return std::to_string(stamp.number) + ' ' + std::to_string(stamp.size) + ' ' +
           std::to_string(stamp.seconds) + ' ' + std::to_string(stamp.nanoseconds);
}

std::map<fl::filesystem::Path, cmlink::FileState> GitAdapter::getFileStates(std::vector<Path> const& files) {
    std::map<Path, cmlink::FileState> result;
    if (files.empty()) {
        return result;
    }
    auto* const found = repository();
    if (found == nullptr) {
        for (auto const& file : files) {
            result.try_emplace(file, cmlink::LocalStatus::NotInRepository);
        }
        return result;
    }
    StateQuery query(*found);
    for (auto const& file : files) {
        result.try_emplace(file, query.stateOf(file));
    }
    return result;
}

/// The files that meet a condition on a query of states; none if there is no repository.
template <typename Condition>
std::set<fl::filesystem::Path> GitAdapter::select(std::vector<Path> const& files,
                                                  Condition const& condition) {
    std::set<Path> result;
    auto* const found = files.empty() ? nullptr : repository();
    if (found != nullptr) {
        StateQuery query(*found);
        std::ranges::copy_if(files, std::inserter(result, result.end()),
                             [&](Path const& file) { return condition(query, file); });
    }
    return result;
}

std::set<fl::filesystem::Path> GitAdapter::ignored(std::vector<Path> const& files) {
    return select(files, [](StateQuery& query, Path const& file) { return query.isIgnored(file); });
}

std::set<fl::filesystem::Path> GitAdapter::leftOut(std::vector<Path> const& files) {
    return select(files, [](StateQuery& query, Path const& file) { return query.isLeftOut(file); });
}

std::set<fl::filesystem::Path> GitAdapter::trackedBelow(std::vector<Path> const& folders) {
    std::set<Path> result;
    auto* const found = folders.empty() ? nullptr : repository();
    if (found == nullptr) {
        return result;
    }
    auto const& index = found->index();
    for (auto const& folder : folders) {
        auto const path = found->workTree().relativeInProject(folder);
        std::size_t position = path ? firstBelow(index, *path) : index.size();
        for (; position < index.size() && isBelow(index.pathAt(position), *path); ++position) {
            std::string const entry = index.pathAt(position);
            result.insert(folder /
                          fl::filesystem::fromSystem(entry.substr(path->empty() ? 0 : path->size() + 1)));
        }
    }
    return result;
}

std::map<fl::filesystem::Path, std::string> GitAdapter::earlierContents(std::vector<Path> const& files,
                                                                        Path const& writer) {
    auto* const found = files.empty() ? nullptr : repository();
    auto const path = found == nullptr ? std::nullopt : found->workTree().relativeInProject(writer);
    return path ? git::earlierContents(*found, files, *path) : std::map<Path, std::string>();
}

std::map<fl::filesystem::Path, std::string> GitAdapter::contentsOnDisk(std::vector<Path> const& files) {
    std::map<Path, std::string> result;
    auto* const found = files.empty() ? nullptr : repository();
    if (found != nullptr) {
        ContentIds ids(*found);
        for (auto const& file : files) {
            if (auto id = ids.onDisk(file)) {
                result.emplace(file, *std::move(id));
            }
        }
    }
    return result;
}

std::vector<SimilarContent> GitAdapter::similarContents(std::vector<std::string> const& before,
                                                        std::vector<Path> const& onDisk, int similarity) {
    std::vector<SimilarContent> result;
    auto* const found = before.empty() || onDisk.empty() ? nullptr : repository();
    if (found == nullptr) {
        return result;
    }
    ContentIds contents(*found);
    SimilarContents similar;
    for (auto const& id : before) {
        similar.addBefore(contents.readStored(id).value_or(std::string()));
    }
    for (std::size_t position = 0; position < onDisk.size(); ++position) {
        if (auto const content = contents.readOnDisk(onDisk[position])) {
            similar.compare(position, *content, similarity, result);
        }
    }
    return result;
}

GitAdapter::Batch::Batch(GitAdapter& adapter) : adapter_(adapter) {
    adapter_.isBatchOpen_ = true;
}

GitAdapter::Batch::~Batch() {
    adapter_.update_.reset();
    adapter_.isBatchOpen_ = false;
}

void GitAdapter::Batch::publish() {
    auto const update = std::exchange(adapter_.update_, nullptr);
    if (update != nullptr) {
        update->publish();
    }
}

} // namespace project::git

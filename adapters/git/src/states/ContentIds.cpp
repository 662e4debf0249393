#include "states/ContentIds.hpp"

#include "repository/FileContent.hpp"
#include "repository/LibGit.hpp"
#include "repository/TrackedFiles.hpp"
#include "states/ConvertedContent.hpp"

namespace project::git {

namespace {

bool hashLink(git_oid& result, std::string const& name) {
    auto const target = readLink(name);
    return target && libgit().git_odb_hash(&result, target->data(), target->size(), GIT_OBJECT_BLOB) == 0;
}

} // namespace

bool hashOnDisk(git_oid& id, Repository const& repository, ContentRules& rules, TreePath const& path,
                struct stat const& found) {
    std::string const name = repository.workTree().onDisk(path);
    if (S_ISLNK(found.st_mode)) {
        return hashLink(id, name);
    }
    return S_ISREG(found.st_mode) && rules.conversionOf(path).foreign.empty() &&
           libgit().git_repository_hashfile(&id, repository.get(), name.c_str(), GIT_OBJECT_BLOB,
                                            path.c_str()) == 0;
}

std::optional<std::string> ContentIds::onDisk(fl::filesystem::Path const& file) {
    auto const path = repository_.workTree().relativeInProject(file);
    if (!path || path->empty()) {
        return std::nullopt;
    }
    std::string const name = repository_.workTree().onDisk(*path);

    struct stat found {};

    if (::lstat(name.c_str(), &found) != 0) {
        return std::nullopt;
    }
    auto const staged = trackedAt(repository_.index(), *path);
    bool const isStaged = staged && (staged->mode & S_IFMT) == (found.st_mode & S_IFMT) &&
                          libgit().git_index_entry_is_conflict(&*staged) == 0 &&
                          !comparison_.isModified(*staged, found);
    if (isStaged) {
        return bytesOf(staged->id);
    }
    git_oid id{};
    return hashOnDisk(id, repository_, rules_, *path, found) ? std::optional(bytesOf(id)) : std::nullopt;
}

std::optional<std::string> ContentIds::readStored(std::string const& id) const {
    git_oid key{};
    libgit().git_oid_fromraw(&key, reinterpret_cast<unsigned char const*>(id.data()));
    git_blob* found = nullptr;
    if (libgit().git_blob_lookup(&found, repository_.get(), &key) != 0) {
        return std::nullopt;
    }
    BlobHandle const blob(found);
    return std::string(static_cast<char const*>(libgit().git_blob_rawcontent(found)),
                       static_cast<std::size_t>(libgit().git_blob_rawsize(found)));
}

std::optional<std::string> ContentIds::readOnDisk(fl::filesystem::Path const& file) {
    auto const path = repository_.workTree().relativeInProject(file);
    if (!path || path->empty() || !rules_.conversionOf(*path).foreign.empty()) {
        return std::nullopt;
    }
    std::string const name = repository_.workTree().onDisk(*path);

    struct stat found {};

    bool const isFile = ::lstat(name.c_str(), &found) == 0 && S_ISREG(found.st_mode);
    auto const content =
        isFile ? readFile(name, Links::NotFollowed, static_cast<std::size_t>(found.st_size)) : std::nullopt;
    return content ? convertedContent(repository_, *path, *content) : std::nullopt;
}

} // namespace project::git

#include "index/BlobWriter.hpp"

#include <cerrno>
#include <system_error>
#include <utility>

#include <git2/sys/odb_backend.h>

#include "project/git/GitError.hpp"
#include "repository/FileContent.hpp"
#include "states/ConvertedContent.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

constexpr auto problem = "NotStaged";
constexpr off_t tooLargeForMemory = off_t{64} << 20;

} // namespace

BlobWriter::BlobWriter(Repository const& repository) : repository_(repository) {
    std::string const folder = libgit().git_repository_commondir(repository.get()) + std::string("objects");
    git_odb* objects = nullptr;
    git_odb_backend* backend = nullptr;
    require(libgit().git_odb_new(&objects), folder, problem);
    objects_.reset(objects);
    require(libgit().git_odb_backend_loose(&backend, folder.c_str(), -1, 0, 0, 0), folder, problem);
    if (auto const code = libgit().git_odb_add_backend(objects, backend, 1); code < 0) {
        backend->free(backend);
        require(code, folder, problem);
    }
}

bool BlobWriter::write(TreePath const& path, struct stat const& onDisk, bool isConverted, git_oid& id) {
    std::string const name = repository_.workTree().onDisk(path);
    if (S_ISREG(onDisk.st_mode) && onDisk.st_size > tooLargeForMemory) {
        auto const code = libgit().git_blob_create_from_workdir(&id, repository_.get(), path.c_str());
        require(code == GIT_ENOTFOUND ? 0 : code, name, problem);
        return code == 0;
    }
    auto const content = S_ISLNK(onDisk.st_mode)
                             ? readLink(name)
                             : readFile(name, Links::NotFollowed, static_cast<std::size_t>(onDisk.st_size));
    if (!content && (errno == ENOENT || errno == ENOTDIR)) {
        return false;
    }
    if (!content) {
        throw GitError(GitError::Kind::Failed, name,
                       errorTexts.get("FileUnreadable", std::generic_category().message(errno)),
                       errorTexts.get("RemedyOfUnreadableFile"));
    }
    store(path, isConverted && S_ISREG(onDisk.st_mode) ? convert(path, *content) : *content, id);
    return true;
}

std::string BlobWriter::convert(TreePath const& path, std::string const& content) const {
    auto result = convertedContent(repository_, path, content);
    if (!result) {
        throwLibGitError(repository_.workTree().onDisk(path), problem);
    }
    return *std::move(result);
}

void BlobWriter::store(TreePath const& path, std::string const& content, git_oid& id) const {
    require(libgit().git_odb_write(&id, objects_.get(), content.data(), content.size(), GIT_OBJECT_BLOB),
            repository_.workTree().onDisk(path), problem);
}

} // namespace project::git

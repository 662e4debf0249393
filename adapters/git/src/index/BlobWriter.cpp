#include "index/BlobWriter.hpp"

#include <cerrno>
#include <system_error>

#include <git2/sys/odb_backend.h>

#include "project/git/GitError.hpp"
#include "repository/FileContent.hpp"

namespace project::git {

namespace {

constexpr auto action = "the file cannot be staged";
constexpr off_t tooLargeForMemory = off_t{64} << 20;

using FilterHandle = std::unique_ptr<git_filter_list, FreedBy<&LibGitFunctions::git_filter_list_free>>;

} // namespace

BlobWriter::BlobWriter(Repository const& repository) : repository_(repository) {
    std::string const folder = libgit().git_repository_commondir(repository.get()) + std::string("objects");
    git_odb* objects = nullptr;
    git_odb_backend* backend = nullptr;
    require(libgit().git_odb_new(&objects), folder, action);
    objects_.reset(objects);
    require(libgit().git_odb_backend_loose(&backend, folder.c_str(), -1, 0, 0, 0), folder, action);
    if (auto const code = libgit().git_odb_add_backend(objects, backend, 1); code < 0) {
        backend->free(backend);
        require(code, folder, action);
    }
}

bool BlobWriter::write(TreePath const& path, struct stat const& onDisk, bool isConverted, git_oid& id) {
    std::string const name = repository_.workTree().onDisk(path);
    if (S_ISREG(onDisk.st_mode) && onDisk.st_size > tooLargeForMemory) {
        auto const code = libgit().git_blob_create_from_workdir(&id, repository_.get(), path.c_str());
        require(code == GIT_ENOTFOUND ? 0 : code, name, action);
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
                       "the file cannot be read: " + std::generic_category().message(errno),
                       "Check its permissions, and try again.");
    }
    store(path, isConverted && S_ISREG(onDisk.st_mode) ? convert(path, *content) : *content, id);
    return true;
}

std::string BlobWriter::convert(TreePath const& path, std::string const& content) const {
    std::string const name = repository_.workTree().onDisk(path);
    git_filter_list* filters = nullptr;
    require(libgit().git_filter_list_load(&filters, repository_.get(), nullptr, path.c_str(),
                                          GIT_FILTER_TO_ODB, GIT_FILTER_DEFAULT),
            name, action);
    FilterHandle const owned(filters);
    git_buf converted = GIT_BUF_INIT;
    auto const code =
        libgit().git_filter_list_apply_to_buffer(&converted, filters, content.data(), content.size());
    std::string result(converted.ptr == nullptr ? "" : converted.ptr, converted.size);
    libgit().git_buf_dispose(&converted);
    require(code, name, action);
    return result;
}

void BlobWriter::store(TreePath const& path, std::string const& content, git_oid& id) const {
    require(libgit().git_odb_write(&id, objects_.get(), content.data(), content.size(), GIT_OBJECT_BLOB),
            repository_.workTree().onDisk(path), action);
}

} // namespace project::git

#include "RecordedCalls.hpp"

#include <array>
#include <cerrno>
#include <climits>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace project::test {

namespace {

RecordedCalls* recording = nullptr;

std::string pathOf(int folder) {
    std::array<char, PATH_MAX> target{};
    auto const link = folder == AT_FDCWD ? "/proc/self/cwd" : "/proc/self/fd/" + std::to_string(folder);
    auto const length = ::readlink(link.c_str(), target.data(), target.size());
    return {target.data(), static_cast<std::size_t>(length < 0 ? 0 : length)};
}

} // namespace

RecordedCalls::RecordedCalls() {
    recording = this;
}

RecordedCalls::~RecordedCalls() {
    recording = nullptr;
}

void RecordedCalls::note(char const* name, int folder, char const* path) {
    if (recording == nullptr) {
        return;
    }
    int const error = errno;
    bool const absolute = *path == '/';
    recording->calls_.push_back({name, absolute ? path : pathOf(folder) + "/" + path});
    errno = error;
}

} // namespace project::test

// NOLINTBEGIN: the linker gives these names
extern "C" {

int __real_open(char const* path, int flags, mode_t mode);
int __real_openat(int folder, char const* path, int flags, mode_t mode);
int __real_fstatat(int folder, char const* path, struct stat* status, int flags);
int __real_lstat(char const* path, struct stat* status);
int __real_mkdirat(int folder, char const* path, mode_t mode);
int __real_unlinkat(int folder, char const* path, int flags);
int __real_rmdir(char const* path);
int __real_renameat(int oldFolder, char const* old, int newFolder, char const* fresh);
int __real_renameat2(int oldFolder, char const* old, int newFolder, char const* fresh, unsigned flags);

int __wrap_open(char const* path, int flags, mode_t mode) {
    project::test::RecordedCalls::note("open", AT_FDCWD, path);
    return __real_open(path, flags, mode);
}

int __wrap_openat(int folder, char const* path, int flags, mode_t mode) {
    project::test::RecordedCalls::note("openat", folder, path);
    return __real_openat(folder, path, flags, mode);
}

int __wrap_fstatat(int folder, char const* path, struct stat* status, int flags) {
    project::test::RecordedCalls::note("fstatat", folder, path);
    return __real_fstatat(folder, path, status, flags);
}

int __wrap_lstat(char const* path, struct stat* status) {
    project::test::RecordedCalls::note("lstat", AT_FDCWD, path);
    return __real_lstat(path, status);
}

int __wrap_mkdirat(int folder, char const* path, mode_t mode) {
    project::test::RecordedCalls::note("mkdirat", folder, path);
    return __real_mkdirat(folder, path, mode);
}

int __wrap_unlinkat(int folder, char const* path, int flags) {
    project::test::RecordedCalls::note("unlinkat", folder, path);
    return __real_unlinkat(folder, path, flags);
}

int __wrap_rmdir(char const* path) {
    project::test::RecordedCalls::note("rmdir", AT_FDCWD, path);
    return __real_rmdir(path);
}

int __wrap_renameat(int oldFolder, char const* old, int newFolder, char const* fresh) {
    project::test::RecordedCalls::note("renameat", oldFolder, old);
    project::test::RecordedCalls::note("renameat", newFolder, fresh);
    return __real_renameat(oldFolder, old, newFolder, fresh);
}

int __wrap_renameat2(int oldFolder, char const* old, int newFolder, char const* fresh, unsigned flags) {
    project::test::RecordedCalls::note("renameat2", oldFolder, old);
    project::test::RecordedCalls::note("renameat2", newFolder, fresh);
    return __real_renameat2(oldFolder, old, newFolder, fresh, flags);
}
}
// NOLINTEND

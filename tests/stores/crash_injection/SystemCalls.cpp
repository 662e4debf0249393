#include "SystemCalls.hpp"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdarg>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>

namespace project::test {

namespace {

SystemCalls* living = nullptr;

bool fails(std::string_view name, std::string_view file = {}, int flags = 0) {
    return living != nullptr && living->fails({name, file, flags});
}

std::size_t cut(std::size_t length) {
    return living != nullptr ? std::min(length, living->mostBytes) : length;
}

/// True if a sync is skipped.
bool isSyncSpared() {
    return living != nullptr && !living->syncs;
}

} // namespace

bool SystemCall::isChange() const {
    constexpr std::array<std::string_view, 9> changes{
        "mkdirat", "rmdir", "renameat", "renameat2", "unlinkat", "futimens", "fchmod", "fchown", "write"};
    bool const isOpening = name == "open" || name == "openat";
    return (isOpening && (flags & (O_CREAT | O_WRONLY | O_RDWR)) != 0) ||
           std::find(changes.begin(), changes.end(), name) != changes.end();
}

SystemCalls::SystemCalls(Answer answer) : answer_(std::move(answer)) {
    living = this;
}

SystemCalls::~SystemCalls() {
    living = nullptr;
}

SystemCalls* SystemCalls::current() {
    return living;
}

bool SystemCalls::fails(SystemCall const& call) {
    ++counts[std::string(call.name)];
    int const error = answer_ ? answer_(call) : 0;
    if (error != 0) {
        errno = error;
    }
    return error != 0;
}

} // namespace project::test

using project::test::cut;
using project::test::fails;

// The names that the linker gives the calls of the program and those of the system.
// NOLINTBEGIN(bugprone-reserved-identifier,cert-dcl37-c,cert-dcl51-cpp,readability-identifier-naming)
extern "C" {

int __real_open(char const* path, int flags, ...);
int __real_openat(int folder, char const* path, int flags, ...);
int __real_close(int file);
ssize_t __real_write(int file, void const* bytes, size_t length);
ssize_t __real_pread(int file, void* bytes, size_t length, off_t offset);
int __real_fdatasync(int file);
int __real_fsync(int file);
int __real_fstat(int file, struct stat* status);
int __real_fstatat(int folder, char const* path, struct stat* status, int flags);
int __real_lstat(char const* path, struct stat* status);
int __real_futimens(int file, timespec const times[2]);
int __real_fchmod(int file, mode_t mode);
int __real_fchown(int file, uid_t owner, gid_t group);
int __real_renameat(int fromFolder, char const* from, int toFolder, char const* to);
int __real_renameat2(int fromFolder, char const* from, int toFolder, char const* to, unsigned int flags);
int __real_unlinkat(int folder, char const* path, int flags);
int __real_mkdirat(int folder, char const* path, mode_t mode);
int __real_rmdir(char const* path);
int __real_flock(int file, int operation);
int __real_fcntl(int file, int command, ...);
DIR* __real_fdopendir(int folder);
dirent* __real_readdir(DIR* folder);
int __real_clock_gettime(clockid_t clock, timespec* time);

int __wrap_clock_gettime(clockid_t clock, timespec* time) {
    auto const* const calls = project::test::SystemCalls::current();
    if (calls == nullptr || !calls->time) {
        return __real_clock_gettime(clock, time);
    }
    *time = *calls->time;
    return 0;
}

int __wrap_open(char const* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    mode_t const mode = (flags & O_CREAT) != 0 ? va_arg(rest, mode_t) : 0;
    va_end(rest);
    return fails("open", path, flags) ? -1 : __real_open(path, flags, mode);
}

int __wrap_openat(int folder, char const* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    mode_t const mode = (flags & O_CREAT) != 0 ? va_arg(rest, mode_t) : 0;
    va_end(rest);
    return fails("openat", path, flags) ? -1 : __real_openat(folder, path, flags, mode);
}

/// The descriptor is closed even when the call fails.
int __wrap_close(int file) {
    bool const isFailing = fails("close");
    int const error = errno;
    int const result = __real_close(file);
    errno = isFailing ? error : errno;
    return isFailing ? -1 : result;
}

ssize_t __wrap_write(int file, void const* bytes, size_t length) {
    return fails("write") ? -1 : __real_write(file, bytes, cut(length));
}

ssize_t __wrap_pread(int file, void* bytes, size_t length, off_t offset) {
    return fails("pread") ? -1 : __real_pread(file, bytes, cut(length), offset);
}

int __wrap_fdatasync(int file) {
    return fails("fdatasync") ? -1 : project::test::isSyncSpared() ? 0 : __real_fdatasync(file);
}

int __wrap_fsync(int file) {
    return fails("fsync") ? -1 : project::test::isSyncSpared() ? 0 : __real_fsync(file);
}

int __wrap_fstat(int file, struct stat* status) {
    return fails("fstat") ? -1 : __real_fstat(file, status);
}

int __wrap_fstatat(int folder, char const* path, struct stat* status, int flags) {
    return fails("fstatat", path) ? -1 : __real_fstatat(folder, path, status, flags);
}

int __wrap_lstat(char const* path, struct stat* status) {
    return fails("lstat", path) ? -1 : __real_lstat(path, status);
}

int __wrap_futimens(int file, timespec const times[2]) {
    return fails("futimens") ? -1 : __real_futimens(file, times);
}

int __wrap_fchmod(int file, mode_t mode) {
    return fails("fchmod") ? -1 : __real_fchmod(file, mode);
}

int __wrap_fchown(int file, uid_t owner, gid_t group) {
    return fails("fchown") ? -1 : __real_fchown(file, owner, group);
}

int __wrap_renameat(int fromFolder, char const* from, int toFolder, char const* to) {
    return fails("renameat", to) ? -1 : __real_renameat(fromFolder, from, toFolder, to);
}

int __wrap_renameat2(int fromFolder, char const* from, int toFolder, char const* to, unsigned int flags) {
    return fails("renameat2", to, static_cast<int>(flags))
               ? -1
               : __real_renameat2(fromFolder, from, toFolder, to, flags);
}

int __wrap_unlinkat(int folder, char const* path, int flags) {
    return fails("unlinkat", path) ? -1 : __real_unlinkat(folder, path, flags);
}

int __wrap_mkdirat(int folder, char const* path, mode_t mode) {
    return fails("mkdirat", path) ? -1 : __real_mkdirat(folder, path, mode);
}

int __wrap_rmdir(char const* path) {
    return fails("rmdir", path) ? -1 : __real_rmdir(path);
}

int __wrap_flock(int file, int operation) {
    return fails("flock") ? -1 : __real_flock(file, operation);
}

int __wrap_fcntl(int file, int command, ...) {
    va_list rest;
    va_start(rest, command);
    auto* const argument = va_arg(rest, void*); // of the commands for locks
    va_end(rest);
    return fails("fcntl") ? -1 : __real_fcntl(file, command, argument);
}

DIR* __wrap_fdopendir(int folder) {
    return fails("fdopendir") ? nullptr : __real_fdopendir(folder);
}

dirent* __wrap_readdir(DIR* folder) {
    return fails("readdir") ? nullptr : __real_readdir(folder);
}
}
// NOLINTEND(bugprone-reserved-identifier,cert-dcl37-c,cert-dcl51-cpp,readability-identifier-naming)

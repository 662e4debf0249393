#include "repository/FileContent.hpp"

#include <cerrno>
#include <climits>

#include <fcntl.h>
#include <unistd.h>

namespace project::git {

std::optional<std::string> readFile(std::string const& name, Links links, std::size_t expectedSize) {
    auto const file =
        ::open(name.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | (links == Links::Followed ? 0 : O_NOFOLLOW));
    if (file < 0) {
        return std::nullopt;
    }
    std::string result(expectedSize + 1, '\0'); // one more, to detect the end
    std::size_t length = 0;
    ssize_t got = 0;
    do {
        if (length == result.size()) {
            result.resize(2 * length);
        }
        got = ::read(file, result.data() + length, result.size() - length);
        length += got > 0 ? static_cast<std::size_t>(got) : 0;
    } while (got > 0 || (got < 0 && errno == EINTR));
    auto const error = errno;
    ::close(file);
    errno = error;
    result.resize(length);
    return got < 0 ? std::nullopt : std::optional(std::move(result));
}

std::optional<std::string> readLink(std::string const& name) {
    std::string result(PATH_MAX, '\0');
    auto const length = ::readlink(name.c_str(), result.data(), result.size());
    if (length < 0) {
        return std::nullopt;
    }
    result.resize(static_cast<std::size_t>(length));
    return result;
}

} // namespace project::git

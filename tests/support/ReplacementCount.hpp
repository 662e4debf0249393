#pragma once

#include <array>
#include <filesystem>
#include <stdexcept>
#include <string>

#include <sys/inotify.h>
#include <unistd.h>

namespace project::test {

/// Counts the replacements of files in a folder.
class ReplacementCount {
public:
    explicit ReplacementCount(std::filesystem::path const& folder)
        : watch_(::inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {
        if (::inotify_add_watch(watch_, folder.c_str(), IN_MOVED_TO | IN_CLOSE_WRITE) < 0) {
            throw std::runtime_error("no watch on " + folder.string());
        }
    }

    ~ReplacementCount() { ::close(watch_); }

    ReplacementCount(ReplacementCount const&) = delete;
    ReplacementCount& operator=(ReplacementCount const&) = delete;

    /// The number of times that a file of that name was moved in or written since the last call.
    int of(std::string const& name) const {
        alignas(inotify_event) std::array<char, 65536> buffer{};
        int result = 0;
        ssize_t length = 0;
        while ((length = ::read(watch_, buffer.data(), buffer.size())) > 0) {
            for (char const* at = buffer.data(); at < buffer.data() + length;) {
                auto const* const event = reinterpret_cast<inotify_event const*>(at);
                result += event->len > 0 && name == event->name ? 1 : 0;
                at += sizeof(inotify_event) + event->len;
            }
        }
        return result;
    }

private:
    int watch_;
};

} // namespace project::test

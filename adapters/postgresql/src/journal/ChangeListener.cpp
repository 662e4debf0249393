#include "journal/ChangeListener.hpp"

#include <array>
#include <cerrno>
#include <cstdint>
#include <utility>

#include <poll.h>
#include <sys/eventfd.h>
#include <unistd.h>

namespace project::postgresql {

ChangeListener::ChangeListener(ServiceSettings const& settings, std::string where, std::string channel)
    : session_(settings, std::move(where)),
      channel_(std::move(channel)),
      waker_(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {
}

ChangeListener::~ChangeListener() {
    ::close(waker_);
}

bool ChangeListener::await(std::chrono::milliseconds time, std::atomic<int> const& ownProcess) {
    Deadline const deadline(time);
    if (listen()) {
        return true;
    }
    try {
        while (!wasWoken() && !hasNotification(ownProcess)) {
            std::array<pollfd, 2> entries{
                {{session_.connection().descriptor(), POLLIN, 0}, {waker_, POLLIN, 0}}};
            int const count =
                ::poll(entries.data(), entries.size(), static_cast<int>(deadline.remaining().count()));
            if (count == 0) {
                return false;
            }
        }
    } catch (ConnectionLost const&) {
        session_.close();
    }
    return true;
}

void ChangeListener::wake() noexcept {
    ::eventfd_write(waker_, 1);
}

/// @return true if the session has just begun to listen.
bool ChangeListener::listen() {
    auto const before = session_.serial();
    auto const deadline = session_.deadline();
    session_.connect(deadline);
    if (session_.serial() == before) {
        return false;
    }
    try {
        auto const text = "LISTEN " + session_.connection().quoted(channel_);
        session_.run({{{"", text.c_str()}, {}}}, deadline);
    } catch (...) {
        session_.close();
        throw;
    }
    return true;
}

bool ChangeListener::hasNotification(int ownProcess) {
    auto sender = session_.connection().notification();
    while (sender && *sender == ownProcess) {
        sender = session_.connection().notification();
    }
    return sender.has_value();
}

bool ChangeListener::wasWoken() {
    eventfd_t count = 0;
    return ::eventfd_read(waker_, &count) == 0;
}

} // namespace project::postgresql

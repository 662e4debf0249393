#pragma once

#include <atomic>
#include <chrono>
#include <string>

#include "journal/ServerSession.hpp"

namespace project::postgresql {

/// A connection of its own that waits for the notifications of a project.
class ChangeListener {
public:
    ChangeListener(ServiceSettings const& settings, std::string where, std::string channel);
    ~ChangeListener();
    ChangeListener(ChangeListener const&) = delete;
    ChangeListener& operator=(ChangeListener const&) = delete;

    /// Waits for a notification that another session sent. Returns early when it has just begun to listen,
    /// because an earlier one may be missed, when the connection is lost, and after wake.
    /// @param ownProcess the process on the server whose notifications do not count.
    /// @return false if the time has run out.
    bool await(std::chrono::milliseconds time, std::atomic<int> const& ownProcess);

    /// Ends the current wait, or else the next one. Any thread may call it.
    void wake() noexcept;

private:
    bool listen();
    bool hasNotification(int ownProcess);
    bool wasWoken();

    ServerSession session_;
    std::string channel_;
    int waker_; ///< readable after wake
};

} // namespace project::postgresql

#include "postgresql/FaultyProxy.hpp"

#include <algorithm>
#include <array>
#include <stdexcept>
#include <vector>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include "postgresql/PostgresServer.hpp"

namespace project::test {

namespace {

sockaddr_in loopback(int port) {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    return address;
}

int newSocket() {
    int const socket = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    int const yes = 1;
    ::setsockopt(socket, IPPROTO_TCP, TCP_NODELAY, &yes, sizeof yes);
    return socket;
}

bool writeAll(int socket, char const* bytes, std::size_t length) {
    while (length > 0) {
        auto const count = ::send(socket, bytes, length, MSG_NOSIGNAL);
        if (count <= 0) {
            return false;
        }
        bytes += count;
        length -= static_cast<std::size_t>(count);
    }
    return true;
}

void closeBoth(int client, int server) {
    for (int const socket : {client, server}) {
        if (socket >= 0) {
            ::close(socket);
        }
    }
}

} // namespace

FaultyProxy::FaultyProxy(int serverPort)
    : serverPort_(serverPort), port_(freePort()), listener_(newSocket()) {
    int const yes = 1;
    ::setsockopt(listener_, SOL_SOCKET, SO_REUSEADDR, &yes, sizeof yes);
    auto const address = loopback(port_);
    if (::bind(listener_, reinterpret_cast<sockaddr const*>(&address), sizeof address) != 0 ||
        ::listen(listener_, 64) != 0) {
        throw std::runtime_error("the proxy cannot listen");
    }
    thread_ = std::thread([this] { serve(); });
}

FaultyProxy::~FaultyProxy() {
    shouldEnd_ = true;
    thread_.join();
    ::close(listener_);
    for (auto const& pair : pairs_) {
        closeBoth(pair.client, pair.server);
    }
}

void FaultyProxy::breakAfter(std::size_t bytes, Fault fault) {
    std::lock_guard const guard(mutex_);
    isArmed_ = true;
    hasBroken_ = false;
    left_ = bytes;
    fault_ = fault;
}

void FaultyProxy::serve() {
    while (!shouldEnd_) {
        std::vector<pollfd> entries{{listener_, POLLIN, 0}};
        for (auto const& pair : pairs_) {
            short const events = pair.isStalled ? 0 : POLLIN;
            entries.push_back({pair.isStalled ? -1 : pair.client, events, 0});
            entries.push_back({pair.isStalled ? -1 : pair.server, events, 0});
        }
        if (::poll(entries.data(), entries.size(), 20) <= 0) {
            continue;
        }
        std::size_t index = 1;
        for (auto pair = pairs_.begin(); pair != pairs_.end(); index += 2) {
            bool isOpen = true;
            if (entries[index].revents != 0) {
                isOpen = pass(*pair, pair->client, pair->server);
            }
            if (isOpen && !pair->isStalled && entries[index + 1].revents != 0) {
                isOpen = pass(*pair, pair->server, pair->client);
            }
            if (!isOpen) {
                closeBoth(pair->client, pair->server);
                --openConnections_;
            }
            pair = isOpen ? std::next(pair) : pairs_.erase(pair);
        }
        if (entries[0].revents != 0) {
            accept();
        }
    }
}

void FaultyProxy::accept() {
    int const client = ::accept4(listener_, nullptr, nullptr, SOCK_CLOEXEC);
    if (hasBroken_ && refusesAfterBreak_) {
        ::close(client);
        return;
    }
    ++connections_;
    int const yes = 1;
    ::setsockopt(client, IPPROTO_TCP, TCP_NODELAY, &yes, sizeof yes);
    int const server = newSocket();
    auto const address = loopback(serverPort_);
    if (::connect(server, reinterpret_cast<sockaddr const*>(&address), sizeof address) != 0) {
        closeBoth(client, server);
        return;
    }
    pairs_.push_back({client, server});
    ++openConnections_;
}

/// Passes on a part. @return false if the connection is to be closed.
bool FaultyProxy::pass(Pair& pair, int from, int to) {
    std::lock_guard const guard(mutex_);
    if (isArmed_ && left_ == 0) {
        return breakNow(pair);
    }
    std::array<char, 65536> buffer{};
    auto const room = isArmed_ ? std::min(buffer.size(), left_) : buffer.size();
    auto const count = ::recv(from, buffer.data(), room, 0);
    if (count <= 0) {
        return false;
    }
    countRequest(pair, from == pair.client, buffer.front());
    if (delay_ > 0) {
        std::this_thread::sleep_for(std::chrono::milliseconds(delay_));
    }
    bool const isOpen = writeAll(to, buffer.data(), static_cast<std::size_t>(count));
    if (isArmed_) {
        left_ -= static_cast<std::size_t>(count);
        if (left_ == 0) {
            return breakNow(pair);
        }
    }
    return isOpen;
}

void FaultyProxy::countRequest(Pair& pair, bool isFromClient, char first) {
    constexpr char farewell = 'X';
    if (isFromClient && pair.isClientsTurn && first != farewell) {
        ++requests_;
    }
    pair.isClientsTurn = !isFromClient;
}

bool FaultyProxy::breakNow(Pair& pair) {
    isArmed_ = false;
    hasBroken_ = true;
    if (fault_ == Fault::Cut) {
        return false;
    }
    pair.isStalled = true;
    if (fault_ == Fault::HalfClose) {
        ::close(pair.client);
        pair.client = -1;
    }
    return true;
}

} // namespace project::test

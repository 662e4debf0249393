#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <list>
#include <mutex>
#include <thread>

namespace project::test {

/// A proxy between clients and a server on the loopback interface. It breaks a connection after a number of
/// bytes, once. One thread serves all connections.
class FaultyProxy {
public:
    enum class Fault {
        Cut,       ///< both sides are closed
        HalfClose, ///< the client's side is closed; the server waits for more
        Stall      ///< both sides stay open, and nothing passes any more
    };

    explicit FaultyProxy(int serverPort);
    ~FaultyProxy();
    FaultyProxy(FaultyProxy const&) = delete;
    FaultyProxy& operator=(FaultyProxy const&) = delete;

    int port() const { return port_; }

    /// Breaks the connection on which the last one of this many bytes passes, counted from now in both
    /// directions.
    void breakAfter(std::size_t bytes, Fault fault);

    /// Whether the connection was broken since breakAfter.
    bool hasBroken() const { return hasBroken_; }

    /// Whether a connection that was broken is the last one: later ones are closed at once.
    void refuseAfterBreak(bool refuses) { refusesAfterBreak_ = refuses; }

    /// Lets each part wait before it passes on.
    void delay(std::chrono::milliseconds time) { delay_ = time.count(); }

    /// The connections so far.
    int connections() const { return connections_; }

    /// The connections that are open now.
    int openConnections() const { return openConnections_; }

    /// The requests of clients so far: what a client sends until the server sends something is one request.
    /// The farewell of a client is not counted.
    int requests() const { return requests_; }

private:
    struct Pair {
        int client;
        int server;
        bool isStalled = false;
        bool isClientsTurn = true; ///< the next part from the client begins a request
    };

    void serve();
    void accept();
    bool pass(Pair& pair, int from, int to);
    void countRequest(Pair& pair, bool isFromClient, char first);
    bool breakNow(Pair& pair);

    int serverPort_;
    int port_;
    int listener_;
    std::atomic<bool> shouldEnd_ = false;
    std::atomic<bool> hasBroken_ = false;
    std::atomic<bool> refusesAfterBreak_ = false;
    std::atomic<long long> delay_ = 0;
    std::atomic<int> connections_ = 0;
    std::atomic<int> openConnections_ = 0;
    std::atomic<int> requests_ = 0;
    std::mutex mutex_;
    bool isArmed_ = false;
    std::size_t left_ = 0;
    Fault fault_ = Fault::Cut;
    std::list<Pair> pairs_;
    std::thread thread_;
};

} // namespace project::test

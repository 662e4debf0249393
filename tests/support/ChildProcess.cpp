#include "support/ChildProcess.hpp"

#include <array>
#include <cerrno>
#include <csignal>
#include <exception>
#include <stdexcept>
#include <utility>

#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

namespace project::test {

namespace {

constexpr uid_t nobody = 65534;

std::array<int, 2> makePipe() {
    std::array<int, 2> ends{};
    if (::pipe(ends.data()) != 0) {
        throw std::runtime_error("no pipe to a child process");
    }
    return ends;
}

char readByte(int from) {
    char byte = '\0';
    ssize_t count = 0;
    do {
        count = ::read(from, &byte, 1);
    } while (count < 0 && errno == EINTR);
    return count == 1 ? byte : '\0';
}

void writeAll(int to, std::string const& text) {
    if (::write(to, text.data(), text.size()) != static_cast<ssize_t>(text.size())) {
        throw std::runtime_error("the other process has ended");
    }
}

} // namespace

void ChildProcess::Parent::say(std::string const& line) const {
    writeAll(to_, line + "\n");
}

void ChildProcess::Parent::await() const {
    readByte(from_);
}

ChildProcess::ChildProcess(std::function<void(Parent const&)> const& run) {
    auto const up = makePipe();
    auto const down = makePipe();
    id_ = ::fork();
    if (id_ == 0) {
        ::close(up[0]);
        ::close(down[1]);
        int status = 1;
        try {
            run(Parent(down[0], up[1]));
            status = 0;
        } catch (...) {
            // the status reports it
        }
        ::_exit(status);
    }
    ::close(up[1]);
    ::close(down[0]);
    from_ = up[0];
    to_ = down[1];
    if (id_ < 0) {
        throw std::runtime_error("no child process");
    }
}

ChildProcess::~ChildProcess() {
    kill();
    ::close(from_);
    ::close(to_);
}

std::string ChildProcess::hear() {
    std::string line;
    for (char byte = readByte(from_); byte != '\n' && byte != '\0'; byte = readByte(from_)) {
        line += byte;
    }
    return line;
}

bool ChildProcess::hasSaid() const {
    pollfd said{from_, POLLIN, 0};
    return ::poll(&said, 1, 0) == 1;
}

void ChildProcess::goOn() const {
    writeAll(to_, "\n");
}

void ChildProcess::kill() {
    if (id_ > 0) {
        ::kill(id_, SIGKILL);
        join();
    }
}

bool ChildProcess::join() {
    int status = 0;
    auto const id = std::exchange(id_, -1);
    while (id > 0 && ::waitpid(id, &status, 0) < 0 && errno == EINTR) {
    }
    return id > 0 && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

std::string inUnprivilegedProcess(std::function<std::string()> const& call) {
    ChildProcess child([&call](ChildProcess::Parent const& parent) {
        if (::geteuid() == 0 && (::setgid(nobody) != 0 || ::setuid(nobody) != 0)) {
            parent.say("cannot give up the rights of root");
            return;
        }
        try {
            parent.say(call());
        } catch (std::exception const& error) {
            parent.say(error.what());
        }
    });
    return child.hear();
}

} // namespace project::test

#pragma once

#include <functional>
#include <string>

#include <sys/types.h>

namespace project::test {

/// A forked process of this program that runs a function and then ends without cleaning up.
class ChildProcess {
public:
    /// A child's end of the connection to its parent.
    class Parent {
    public:
        Parent(int from, int to) : from_(from), to_(to) {}

        void say(std::string const& line) const;

        /// Waits until the parent calls goOn or ends.
        void await() const;

    private:
        int from_;
        int to_;
    };

    explicit ChildProcess(std::function<void(Parent const&)> const& run);

    /// Kills the child if it is still running.
    ~ChildProcess();
    ChildProcess(ChildProcess const&) = delete;
    ChildProcess& operator=(ChildProcess const&) = delete;

    pid_t id() const { return id_; }

    /// The next line that the child says; empty if it has ended without one.
    std::string hear();

    /// True if a line is available or the child has ended, so that hear does not wait.
    bool hasSaid() const;

    /// Lets a child that waits in await continue.
    void goOn() const;

    void kill();

    /// @return true if the child's function returned without an exception.
    bool join();

private:
    pid_t id_;
    int from_ = -1;
    int to_ = -1;
};

/// Calls a function in a process of its own, with the rights of an ordinary user. @return its result, or the
/// text of its exception.
std::string inUnprivilegedProcess(std::function<std::string()> const& call);

} // namespace project::test

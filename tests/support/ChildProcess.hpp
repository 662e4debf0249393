#pragma once

#include <functional>
#include <string>

#include <sys/types.h>

namespace project::test {

/// A forked process of this program that runs a function and then ends without cleaning up.
class ChildProcess {
public:
    /// A child's end of the talk with its parent.
    class Parent {
    public:
        Parent(int from, int to) : from_(from), to_(to) {}

        void say(std::string const& line) const;

        /// Waits for the parent to say something, or to go away.
        void await() const;

    private:
        int from_;
        int to_;
    };

    explicit ChildProcess(std::function<void(Parent const&)> const& run);

    /// Ends the child if it is still there.
    ~ChildProcess();
    ChildProcess(ChildProcess const&) = delete;
    ChildProcess& operator=(ChildProcess const&) = delete;

    pid_t id() const { return id_; }

    /// The next line that the child says; empty when it has ended without one.
    std::string hear();

    /// True when there is a line to hear, or the child has ended, so that hear does not wait.
    bool hasSaid() const;

    /// Lets a child that awaits go on.
    void goOn() const;

    void kill();

    /// @return true when the child came to the end of its function, which threw nothing.
    bool join();

private:
    pid_t id_;
    int from_ = -1;
    int to_ = -1;
};

/// What a function gives, or the text of what it throws, in a process of its own with no more rights than any
/// user has.
std::string inUnprivilegedProcess(std::function<std::string()> const& call);

} // namespace project::test

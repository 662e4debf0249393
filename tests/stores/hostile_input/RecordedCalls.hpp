#pragma once

#include <string>
#include <vector>

namespace project::test {

/// Notes all that the code of this program opens, makes, changes the name of or removes while it lives, as
/// the kernel names it: the folder that is really open, and what was asked for in it. The program must be
/// linked with the options that lead these calls here.
class RecordedCalls {
public:
    RecordedCalls();
    ~RecordedCalls();
    RecordedCalls(RecordedCalls const&) = delete;
    RecordedCalls& operator=(RecordedCalls const&) = delete;

    struct Call {
        std::string name;
        std::string path;
    };

    std::vector<Call> const& calls() const { return calls_; }

    /// Called for each call.
    static void note(char const* name, int folder, char const* path);

private:
    std::vector<Call> calls_;
};

} // namespace project::test

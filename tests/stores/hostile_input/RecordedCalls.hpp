#pragma once

#include <string>
#include <vector>

namespace project::test {

/// Records every file and folder that the code of this program opens, creates, renames or deletes while the
/// object lives, by the kernel's name of the open folder and the name in it. The program must be linked with
/// the options that redirect these calls.
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

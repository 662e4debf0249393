#pragma once

#include <string>

#include <sys/types.h>

namespace projectctl {

/// Shows standard output in a pager as long as it exists: PROJECTCTL_PAGER, else PAGER, else less. There is
/// none if the output is not a terminal, if the command is empty or "cat", on a dumb terminal, and with
/// --no-pager.
///
/// The destructor ends the output and waits for the pager.
class Pager {
public:
    Pager();
    ~Pager();
    Pager(Pager const&) = delete;
    Pager& operator=(Pager const&) = delete;

private:
    void start(std::string const& command);

    pid_t child_ = -1; ///< -1 if there is no pager
};

} // namespace projectctl

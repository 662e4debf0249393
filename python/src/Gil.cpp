#include "Gil.hpp"

#include <unistd.h>

namespace project::python {

namespace {

/// Runs an action that takes the interpreter. A thread that comes too late, after the interpreter has begun
/// to shut down, is ended by Python; its stack must not be unwound, because the objects on it need the
/// interpreter. So it sleeps until the process ends, which is at once.
template <typename Action>
auto orSleep(Action const& action) noexcept {
    try {
        return action();
    } catch (...) { // the unwinding of pthread_exit
        for (;;) {
            pause();
        }
    }
}

} // namespace

WithoutGil::~WithoutGil() {
    orSleep([this] { PyEval_RestoreThread(state_); });
}

WithGil::WithGil() : state_(orSleep([] { return PyGILState_Ensure(); })) {
}

} // namespace project::python

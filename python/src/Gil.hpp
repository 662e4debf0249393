#pragma once

#include <Python.h>

namespace project::python {

// The global lock of the interpreter is never held while the library waits or uses the disk: a thread that
// waits for a project with that lock held, while another one has the project and waits for that lock, would
// wait for ever. pybind11's own guards end a thread while the interpreter shuts down, in a destructor, which
// ends the process; those here let it sleep instead.

/// Releases the interpreter as long as it exists.
class WithoutGil {
public:
    WithoutGil() : state_(PyEval_SaveThread()) {}

    WithoutGil(WithoutGil const&) = delete;
    WithoutGil& operator=(WithoutGil const&) = delete;
    ~WithoutGil();

private:
    PyThreadState* state_;
};

/// Holds the interpreter as long as it exists. For any thread, whether it holds it already or not.
class WithGil {
public:
    WithGil();
    WithGil(WithGil const&) = delete;
    WithGil& operator=(WithGil const&) = delete;

    ~WithGil() { PyGILState_Release(state_); }

private:
    PyGILState_STATE state_;
};

} // namespace project::python

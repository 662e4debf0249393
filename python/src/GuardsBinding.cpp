#include <memory>
#include <optional>
#include <stdexcept>
#include <thread>
#include <utility>

#include "Bindings.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

/// Something that holds the project's lock, and belongs to the thread that took it. Shares the session, so
/// that a project that is closed meanwhile ends after it.
template <typename Held>
class OfThread {
public:
    template <typename Take>
    OfThread(std::shared_ptr<Session> session, Take const& take)
        : content_(new Content{std::move(session), take()}) {}

    OfThread(OfThread const&) = delete;
    OfThread& operator=(OfThread const&) = delete;

    /// On another thread, the lock cannot be released. It stays taken, and the process lives on.
    ~OfThread() {
        if (isOfThisThread()) {
            end();
        } else {
            static_cast<void>(content_.release());
        }
    }

    /// Releases what is held.
    void end() {
        requireThisThread();
        WithoutGil const withoutGil;
        content_.reset();
    }

    Held& held() {
        requireThisThread();
        if (!content_) {
            throw std::runtime_error("it has ended already");
        }
        return content_->held;
    }

private:
    struct Content {
        std::shared_ptr<Session> session; // destroyed last
        Held held;
    };

    bool isOfThisThread() const { return content_ == nullptr || thread_ == std::this_thread::get_id(); }

    void requireThisThread() const {
        if (!isOfThisThread()) {
            throw std::runtime_error("it belongs to another thread");
        }
    }

    std::thread::id thread_ = std::this_thread::get_id();
    std::unique_ptr<Content> content_;
};

using Guard = OfThread<cmlink::ReentrantReadWriteLock::LockGuard>;
using OpenTransaction = OfThread<session::Transaction>;

std::unique_ptr<OpenTransaction> begin(OpenProject const& project) {
    WithoutGil const withoutGil;
    auto session = project.session();
    auto& used = *session;
    return std::make_unique<OpenTransaction>(std::move(session), [&used] { return used.transaction(); });
}

std::unique_ptr<Guard> read(OpenProject const& project) {
    WithoutGil const withoutGil;
    auto session = project.session();
    auto& used = *session;
    return std::make_unique<Guard>(std::move(session), [&used] { return used.store().acquireReadLock(); });
}

void commit(OpenTransaction& transaction) {
    auto& held = transaction.held();
    WithoutGil const withoutGil;
    held.commit();
}

} // namespace

void bindGuards(py::module_& module, ProjectClass& project) {
    py::class_<OpenTransaction>(module, "OpenTransaction", "A transaction that has begun.")
        .def("commit", &commit)
        .def("end", &OpenTransaction::end, "Rolls everything back that was not committed.");
    py::class_<Guard>(module, "ReadGuard", "A guard that keeps one state of the project visible.")
        .def("end", &Guard::end);
    project.def("begin", &begin);
    project.def("read", &read);
}

} // namespace project::python

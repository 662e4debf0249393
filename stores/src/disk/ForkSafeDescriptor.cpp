#include "disk/ForkSafeDescriptor.hpp"

#include <cerrno>
#include <mutex>
#include <set>

#include <pthread.h>
#include <unistd.h>

#include "disk/SystemError.hpp"

namespace project::stores {

/// All such descriptors of the process. Never destroyed, since a store may be a static object.
class ForkRegistry {
public:
    static ForkRegistry& instance() {
        static auto* const registry = new ForkRegistry;
        return *registry;
    }

    std::mutex mutex;
    std::set<ForkSafeDescriptor*> descriptors;

private:
    ForkRegistry() {
        pthread_atfork([] { instance().mutex.lock(); }, [] { instance().mutex.unlock(); },
                       [] {
                           instance().closeAll();
                           instance().mutex.unlock();
                       });
    }

    void closeAll() noexcept {
        for (auto* descriptor : descriptors) {
            if (descriptor->descriptor_ >= 0) {
                ::close(descriptor->descriptor_);
                descriptor->descriptor_ = -1;
            }
            descriptor->isInForkedChild_ = true;
        }
    }
};

ForkSafeDescriptor::ForkSafeDescriptor() {
    auto& registry = ForkRegistry::instance();
    std::lock_guard const guard(registry.mutex);
    registry.descriptors.insert(this);
}

ForkSafeDescriptor::~ForkSafeDescriptor() {
    close();
    auto& registry = ForkRegistry::instance();
    std::lock_guard const guard(registry.mutex);
    registry.descriptors.erase(this);
}

bool ForkSafeDescriptor::open(std::function<int()> const& call) {
    close();
    std::lock_guard const guard(ForkRegistry::instance().mutex);
    descriptor_ = repeatWhenInterrupted(call);
    return descriptor_ >= 0;
}

int ForkSafeDescriptor::close() noexcept {
    if (descriptor_ < 0) {
        return 0;
    }
    std::lock_guard const guard(ForkRegistry::instance().mutex);
    int const closed = ::close(descriptor_);
    descriptor_ = -1; // also after EINTR, since Linux has closed the descriptor by then
    return closed == 0 || errno == EINTR ? 0 : errno;
}

} // namespace project::stores

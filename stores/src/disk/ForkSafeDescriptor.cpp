#include "disk/ForkSafeDescriptor.hpp"

#include <cerrno>
#include <mutex>
#include <set>

#include <pthread.h>
#include <unistd.h>

namespace project::stores {

/// All the descriptors of the process. It is never destroyed: a store may live in a static object.
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
            descriptor->inForkedChild_ = true;
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
    do {
        descriptor_ = call();
    } while (descriptor_ < 0 && errno == EINTR);
    return descriptor_ >= 0;
}

int ForkSafeDescriptor::close() noexcept {
    if (descriptor_ < 0) {
        return 0;
    }
    std::lock_guard const guard(ForkRegistry::instance().mutex);
    int const closed = ::close(descriptor_);
    descriptor_ = -1; // also after EINTR, where the descriptor is gone all the same
    return closed == 0 || errno == EINTR ? 0 : errno;
}

} // namespace project::stores

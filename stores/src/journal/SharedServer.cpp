#include "project/stores/SharedServer.hpp"

#include <algorithm>
#include <string_view>

#include <dlfcn.h>

#include "project/stores/StoreError.hpp"

namespace project::stores {

namespace {

bool isLowerCase(std::string_view text) {
    return !text.empty() && std::ranges::all_of(text, [](char c) { return c >= 'a' && c <= 'z'; });
}

void requireNames(std::string const& kind, std::string const& service) {
    if (!isLowerCase(kind)) {
        throw StoreError(StoreError::Kind::Refused, kind, 0, "is not a kind of server",
                         "Use lower-case letters, for example \"postgresql\".");
    }
    if (service.empty() || service.find_first_of("=:/") != std::string::npos) {
        throw StoreError(StoreError::Kind::Refused, service, 0, "is not the name of a service",
                         "Give the server a name in the configuration of its client library, and use that.");
    }
}

/// @throws StoreError with the reason of the system's loader.
void* loadLibrary(std::string const& kind) {
    std::string const name = "libproject_" + kind + ".so." + PROJECT_STORES_SOVERSION;
    void* const library = dlopen(name.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (library == nullptr) {
        char const* const reason = dlerror();
        throw StoreError(StoreError::Kind::Refused, name, 0,
                         "cannot be loaded" + (reason == nullptr ? "" : ": " + std::string(reason)),
                         "The project is stored on a server. Install the library for " + kind + " projects.");
    }
    return library;
}

} // namespace

std::unique_ptr<SharedServer> connectTo(std::string const& kind, std::string const& service) {
    requireNames(kind, service);
    auto* const make =
        reinterpret_cast<MakeSharedServer>(dlsym(loadLibrary(kind), "project_make_shared_server"));
    if (make == nullptr) {
        throw StoreError(StoreError::Kind::Refused, "libproject_" + kind, 0,
                         "is not a library for shared projects",
                         "Install the library of the same version as this program.");
    }
    return std::unique_ptr<SharedServer>(make(service.c_str()));
}

} // namespace project::stores

#include "project/stores/SharedServer.hpp"

#include <algorithm>
#include <string_view>

#include <dlfcn.h>

#include "fl/i18n/MessageCatalog.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

bool isLowerCase(std::string_view text) {
    return !text.empty() && std::ranges::all_of(text, [](char c) { return c >= 'a' && c <= 'z'; });
}

void requireNames(std::string const& kind, std::string const& service) {
    if (!isLowerCase(kind)) {
        throw StoreError(StoreError::Kind::Refused, kind, 0, errorTexts.get("NotAKind"),
                         errorTexts.get("RemedyOfKind"));
    }
    if (service.empty() || service.find_first_of("=:/") != std::string::npos) {
        throw StoreError(StoreError::Kind::Refused, service, 0, errorTexts.get("NotAService"),
                         errorTexts.get("RemedyOfService"));
    }
}

/// @throws StoreError with the reason of the system's loader.
void* loadLibrary(std::string const& kind) {
    std::string const name = "libproject_" + kind + ".so." + PROJECT_STORES_SOVERSION;
    void* const library = dlopen(name.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (library == nullptr) {
        char const* const reason = dlerror();
        throw StoreError(StoreError::Kind::Refused, name, 0,
                         reason == nullptr ? errorTexts.get("CannotLoad")
                                           : errorTexts.get("CannotLoadBecause", reason),
                         errorTexts.get("RemedyOfLoading", kind));
    }
    return library;
}

} // namespace

std::unique_ptr<SharedServer> connectTo(std::string const& kind, std::string const& service) {
    requireNames(kind, service);
    auto* const make =
        reinterpret_cast<MakeSharedServer>(dlsym(loadLibrary(kind), "project_make_shared_server"));
    if (make == nullptr) {
        throw StoreError(StoreError::Kind::Refused, "libproject_" + kind, 0, errorTexts.get("NotALibrary"),
                         errorTexts.get("RemedyOfLibrary"));
    }
    return std::unique_ptr<SharedServer>(
        make(service.c_str(), fl::i18n::MessageCatalog::getGlobalLocale().c_str()));
}

} // namespace project::stores

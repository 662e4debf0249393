#include "SessionStore.hpp"

#include <limits>
#include <string>
#include <utility>

#include "project/stores/FileJournalCache.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SharedServer.hpp"
#include "project/stores/SystemDisk.hpp"

namespace project::session {

using stores::Backend;
using stores::JournalBackend;
using stores::SharedLocation;
using stores::TextBackend;

SessionStore::SessionStore(Path const& root, Options const& options)
    : tree_(std::make_shared<stores::TreeMetadataManager>(makeBackend(root, options),
                                                          root / TextBackend::folderName)) {
}

std::unique_ptr<Backend> SessionStore::makeBackend(Path const& root, Options const& options) {
    auto const folder = stores::makeSystemDisk(root, TextBackend::folderName);
    auto const location = stores::readSharedLocation(*folder);
    return location ? makeLog(root, *location, options) : makeText(root, options);
}

std::unique_ptr<Backend> SessionStore::makeText(Path const& root, Options const& options) {
    TextBackend::Options textOptions;
    if (options.sourceControl == SourceControl::EachChange) {
        textOptions.alwaysRewritten = std::numeric_limits<std::size_t>::max(); // a staged text has no tail
    }
    auto backend =
        std::make_unique<TextBackend>(stores::makeSystemDisk(root, TextBackend::folderName), textOptions);
    text_ = backend.get();
    file_ = TextBackend::textPath(root);
    return backend;
}

std::unique_ptr<Backend> SessionStore::makeLog(Path const& root, SharedLocation const& location,
                                               Options const& options) {
    JournalBackend::Options logOptions;
    logOptions.freshness = options.freshness;
    logOptions.readsLastState = options.readsLastState;
    auto journal = stores::connectTo(location.kind, location.service)->open(location.project);
    auto cache = std::make_unique<stores::FileJournalCache>(
        stores::makeSystemDisk(root / TextBackend::folderName, SharedLocation::cacheName), location.project);
    auto backend = std::make_unique<JournalBackend>(std::move(journal), logOptions, std::move(cache));
    log_ = backend.get();
    file_ = root / TextBackend::folderName / SharedLocation::fileName;
    return backend;
}

} // namespace project::session

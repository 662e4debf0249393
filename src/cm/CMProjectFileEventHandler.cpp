#include "cm/CMProjectFileEventHandler.hpp"

#include <utility>

namespace project::management {

namespace {

/// Empties the set into a list in Path order.
std::vector<Path> takeAll(std::set<Path>& pending) {
    std::vector<Path> result(pending.begin(), pending.end());
    pending.clear();
    return result;
}

} // namespace

CMProjectFileEventHandler::CMProjectFileEventHandler(cmlink::CMAdapter& adapter, Path const& root)
    : adapter_(adapter), actionManager_(adapter_), root_(root) {
}

// Both functions empty the set before they call the adapter: if it throws, the files must not be passed
// again with the next notification, which may belong to an unrelated change.

void CMProjectFileEventHandler::fileRemovalRequested(metadata::MetadataManager& /*store*/,
                                                     Path const& /*metadataRoot*/,
                                                     std::vector<Path> const& files) {
    noteRemoval(files);
    actionManager_.remove(takeAll(noted_.removals));
}

void CMProjectFileEventHandler::fileAdditionRequested(metadata::MetadataManager& /*store*/,
                                                      std::vector<Path> const& files) {
    noteAddition(files);
    actionManager_.add(takeAll(noted_.additions), root_);
}

bool CMProjectFileEventHandler::acceptsFileChangeRequests() {
    return true;
}

void CMProjectFileEventHandler::noteAddition(std::vector<Path> const& files) {
    noted_.additions.insert(files.begin(), files.end());
}

void CMProjectFileEventHandler::noteRemoval(std::vector<Path> const& files) {
    noted_.removals.insert(files.begin(), files.end());
}

NotedFiles CMProjectFileEventHandler::exchangeNoted(NotedFiles files) {
    return std::exchange(noted_, std::move(files));
}

} // namespace project::management

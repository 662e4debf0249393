#include "project/WriteShield.hpp"

namespace projectctl {

WriteShield::~WriteShield() {
    if (isRaised_) {
        pthread_sigmask(SIG_SETMASK, &before_,
                        nullptr); // a signal that arrived in the meantime ends the process here
    }
}

void WriteShield::raise() {
    if (isRaised_) {
        return;
    }
    sigset_t blocked;
    sigemptyset(&blocked);
    for (int const signal : {SIGINT, SIGTERM, SIGHUP, SIGQUIT}) {
        sigaddset(&blocked, signal);
    }
    pthread_sigmask(SIG_BLOCK, &blocked, &before_);
    isRaised_ = true;
}

void WriteShield::fileRemovalRequested(project::metadata::MetadataManager& /*store*/,
                                       project::metadata::Path const& /*metadataRoot*/,
                                       std::vector<project::metadata::Path> const& /*files*/) {
    raise();
}

void WriteShield::fileAdditionRequested(project::metadata::MetadataManager& /*store*/,
                                        std::vector<project::metadata::Path> const& /*files*/) {
    raise();
}

bool WriteShield::acceptsFileChangeRequests() {
    return true;
}

} // namespace projectctl

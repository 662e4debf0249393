#include "project/WriteShield.hpp"

namespace projectctl {

WriteShield::~WriteShield() {
    if (raised_) {
        pthread_sigmask(SIG_SETMASK, &before_, nullptr); // a signal that came meanwhile ends the process here
    }
}

void WriteShield::raise() {
    if (raised_) {
        return;
    }
    sigset_t held;
    sigemptyset(&held);
    for (int const signal : {SIGINT, SIGTERM, SIGHUP, SIGQUIT}) {
        sigaddset(&held, signal);
    }
    pthread_sigmask(SIG_BLOCK, &held, &before_);
    raised_ = true;
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

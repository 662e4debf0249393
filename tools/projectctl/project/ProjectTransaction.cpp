#include "project/ProjectTransaction.hpp"

namespace projectctl {

ProjectTransaction::ProjectTransaction(OpenProject& project)
    : project_(project),
      changes_(project.session_.transaction()),
      earlierReturned_(project.returned_.size()) {
    ++project_.openTransactions_;
}

ProjectTransaction::~ProjectTransaction() {
    --project_.openTransactions_;
    if (!isCommitted_) {
        project_.returned_.erase(project_.returned_.begin() + static_cast<std::ptrdiff_t>(earlierReturned_),
                                 project_.returned_.end());
    }
}

void ProjectTransaction::commit() {
    changes_.commit();
    isCommitted_ = true;
}

} // namespace projectctl

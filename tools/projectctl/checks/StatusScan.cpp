#include "checks/StatusScan.hpp"

namespace projectctl {

void StatusScan::run(Progress& progress) {
    auto const guard = project_.store().acquireReadLock();
    found_ = project_.access().compareWithDisk(project_.root(),
                                               [&progress](std::size_t seen) { progress.reach(seen); });
}

} // namespace projectctl

#pragma once

#include <array>
#include <iosfwd>
#include <map>
#include <string>
#include <vector>

#include "support/CrashingDisk.hpp"

namespace project::test {

/// A fault, and whether the power is cut right after the operation.
struct FaultKind {
    char const* name;
    CrashingVolume::InjectedFault fault;
    bool cutsPower;

    bool kills() const;
};

std::vector<FaultKind> const& faultKinds();

/// The number of calls of each name with each kind of fault.
class CrashPointCounts {
public:
    /// @param call as the volume records it, with the names of files.
    /// @param isInRecovery whether a process had died before.
    void add(FaultKind const& kind, std::string const& call, bool isInRecovery);

    /// A power cut after an operation without a fault.
    void addQuietPowerCut() { ++quietPowerCuts_; }

    std::size_t total() const;

    /// Every combination of a call and a fault that was never reached.
    std::vector<std::string> missing() const;

    void print(std::ostream& out) const;

private:
    using Row = std::map<std::string, std::size_t>; ///< by the name of the fault

    std::map<std::string, Row> rows_; ///< by the name of the call
    std::size_t inRecovery_ = 0;
    std::size_t quietPowerCuts_ = 0;
};

} // namespace project::test

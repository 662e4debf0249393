#pragma once

#include <array>
#include <iosfwd>
#include <map>
#include <string>
#include <vector>

#include "support/CrashingDisk.hpp"

namespace project::test {

/// A trouble, and whether the power is cut right after the operation that it came to has ended.
struct KindOfTrouble {
    char const* name;
    CrashingVolume::Trouble trouble;
    bool cutsPower;

    bool kills() const;
};

std::vector<KindOfTrouble> const& kindsOfTrouble();

/// How many calls of each name had each kind of trouble.
class CrashPointCounts {
public:
    /// @param call as the volume records it, with the names of files.
    /// @param isInRecovery when somebody had died in the project before.
    void add(KindOfTrouble const& kind, std::string const& call, bool isInRecovery);

    /// A power cut after an operation that had no trouble.
    void addQuietPowerCut() { ++quietPowerCuts_; }

    std::size_t total() const;

    /// Every call that a disk makes and that can have trouble, with every kind of it, that never came
    /// together.
    std::vector<std::string> missing() const;

    void print(std::ostream& out) const;

private:
    using Row = std::map<std::string, std::size_t>; ///< by the name of the trouble

    std::map<std::string, Row> rows_; ///< by the name of the call
    std::size_t inRecovery_ = 0;
    std::size_t quietPowerCuts_ = 0;
};

} // namespace project::test

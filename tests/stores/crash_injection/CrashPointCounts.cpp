#include "CrashPointCounts.hpp"

#include <iomanip>
#include <ostream>

namespace project::test {

namespace {

using InjectedFault = CrashingVolume::InjectedFault;

/// Not included are the clock, a wait, and unlocking: they do not fail, and dying there is the same as dying
/// Not included are the clock, a wait, and unlocking: they do not fail, and dying there is the same as dying
/// before the next call.
constexpr char const* callsOfADisk[] = {
    "openFolder", "makeFolder",     "removeFolder", "isFolderInPlace", "lock",       "lockHolder",
    "identify",   "identifyByPath", "read",         "append",          "create",     "sync",
    "exchange",   "rename",         "renameToFree", "remove",          "syncFolder", "list"};

} // namespace

bool FaultKind::kills() const {
    return fault != InjectedFault::Fails && fault != InjectedFault::FailsForGood;
}

std::vector<FaultKind> const& faultKinds() {
    static std::vector<FaultKind> const kinds{
        {"fails", InjectedFault::Fails, false},
        {"fails, cut", InjectedFault::Fails, true},
        {"for good", InjectedFault::FailsForGood, false},
        {"for good, cut", InjectedFault::FailsForGood, true},
        {"dies before", InjectedFault::DiesBefore, false},
        {"dies amid", InjectedFault::DiesAmid, false},
        {"dies after", InjectedFault::DiesAfter, false},
        {"cut before", InjectedFault::DiesBefore, true},
        {"cut amid", InjectedFault::DiesAmid, true},
        {"cut after", InjectedFault::DiesAfter, true},
    };
    return kinds;
}

void CrashPointCounts::add(FaultKind const& kind, std::string const& call, bool isInRecovery) {
    ++rows_[call.substr(0, call.find(' '))][kind.name];
    inRecovery_ += isInRecovery ? 1 : 0;
}

std::size_t CrashPointCounts::total() const {
    std::size_t total = quietPowerCuts_;
    for (auto const& [call, row] : rows_) {
        for (auto const& [kind, count] : row) {
            total += count;
        }
    }
    return total;
}

std::vector<std::string> CrashPointCounts::missing() const {
    std::vector<std::string> result;
    for (std::string const call : callsOfADisk) {
        auto const row = rows_.find(call);
        for (auto const& kind : faultKinds()) {
            if (row == rows_.end() || !row->second.contains(kind.name)) {
                result.push_back(call + " " + kind.name);
            }
        }
    }
    return result;
}

void CrashPointCounts::print(std::ostream& out) const {
    constexpr int nameWidth = 16;
    constexpr int numberWidth = 14;
    out << std::setw(nameWidth) << std::left << "call" << std::right;
    for (auto const& kind : faultKinds()) {
        out << std::setw(numberWidth) << kind.name;
    }
    out << '\n';
    for (auto const& [call, row] : rows_) {
        out << std::setw(nameWidth) << std::left << call << std::right;
        for (auto const& kind : faultKinds()) {
            auto const found = row.find(kind.name);
            out << std::setw(numberWidth) << (found == row.end() ? 0 : found->second);
        }
        out << '\n';
    }
    out << "power cut after an operation without fault: " << quietPowerCuts_ << "\ntogether: " << total()
        << ", of them " << inRecovery_ << " in recoveries\n";
}

} // namespace project::test

#include "CrashPointCounts.hpp"

#include <iomanip>
#include <ostream>

namespace project::test {

namespace {

using Trouble = CrashingVolume::Trouble;

/// Not in it are the clock, a wait, and letting the lock go: they don't fail, and whoever dies there has died
/// before the next call.
constexpr char const* callsOfADisk[] = {
    "openFolder", "makeFolder",     "removeFolder", "isFolderInPlace", "lock",       "lockHolder",
    "identify",   "identifyByPath", "read",         "append",          "create",     "sync",
    "exchange",   "rename",         "renameToFree", "remove",          "syncFolder", "list"};

} // namespace

bool KindOfTrouble::kills() const {
    return trouble != Trouble::Fails && trouble != Trouble::FailsForGood;
}

std::vector<KindOfTrouble> const& kindsOfTrouble() {
    static std::vector<KindOfTrouble> const kinds{
        {"fails", Trouble::Fails, false},
        {"fails, cut", Trouble::Fails, true},
        {"for good", Trouble::FailsForGood, false},
        {"for good, cut", Trouble::FailsForGood, true},
        {"dies before", Trouble::DiesBefore, false},
        {"dies amid", Trouble::DiesAmid, false},
        {"dies after", Trouble::DiesAfter, false},
        {"cut before", Trouble::DiesBefore, true},
        {"cut amid", Trouble::DiesAmid, true},
        {"cut after", Trouble::DiesAfter, true},
    };
    return kinds;
}

void CrashPointCounts::add(KindOfTrouble const& kind, std::string const& call, bool isInRecovery) {
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
        for (auto const& kind : kindsOfTrouble()) {
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
    for (auto const& kind : kindsOfTrouble()) {
        out << std::setw(numberWidth) << kind.name;
    }
    out << '\n';
    for (auto const& [call, row] : rows_) {
        out << std::setw(nameWidth) << std::left << call << std::right;
        for (auto const& kind : kindsOfTrouble()) {
            auto const found = row.find(kind.name);
            out << std::setw(numberWidth) << (found == row.end() ? 0 : found->second);
        }
        out << '\n';
    }
    out << "power cut after an operation without trouble: " << quietPowerCuts_ << "\ntogether: " << total()
        << ", of them " << inRecovery_ << " in recoveries\n";
}

} // namespace project::test

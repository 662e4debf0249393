#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>

#include "SystemCalls.hpp"
#include "SystemOperations.hpp"

namespace project::test {

/// Projects in real folders, on a system with faults or with fewer features than others.
class SystemFaults : public testing::Test {
protected:
    /// In memory if there is such a folder: nothing is synced here, and creating folders on disk is slow.
    static void SetUpTestSuite();

    /// Injects a fault into one call, after a number of others. @return false if the operation makes fewer
    /// calls.
    /// @param system the results of the other calls.
    bool failAt(SystemOperation const& operation, std::size_t callsBefore, int error, bool isForGood,
                SystemCalls::Answer const& system = nullptr);

    /// Runs an operation on a system of a certain kind. @return the error, or nothing.
    static std::optional<StoreError> perform(SystemOperation const& operation, RealProject& project,
                                             SystemCalls::Answer const& answer);
    static void checkAfterwards(SystemOperation const& operation, RealProject& project,
                                std::optional<StoreError> const& error);
    static void checkNextWriter(SystemOperation const& operation, RealProject const& project,
                                Content const& found);

    std::map<std::string, std::size_t, std::less<>> hits; ///< by call
};

} // namespace project::test

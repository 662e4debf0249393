#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>

#include "SystemCalls.hpp"
#include "SystemDeeds.hpp"

namespace project::test {

/// Projects in real folders, over a system that fails or that can do less than others.
class SystemFaults : public testing::Test {
protected:
    /// In memory where there is such a folder: nothing is synced here, and disks are slow at making folders.
    static void SetUpTestSuite();

    /// Lets the call after so many others fail. @return false when the deed makes fewer.
    /// @param system what the system does otherwise.
    bool failAt(SystemDeed const& deed, std::size_t callsBefore, int error, bool isForGood,
                SystemCalls::Answer const& system = nullptr);

    /// Lets a deed meet a system of a certain kind. @return what the error said, or nothing.
    static std::optional<StoreError> perform(SystemDeed const& deed, RealProject& project,
                                             SystemCalls::Answer const& answer);
    static void checkAfterwards(SystemDeed const& deed, RealProject& project,
                                std::optional<StoreError> const& error);
    static void checkNextWriter(SystemDeed const& deed, RealProject const& project, Content const& found);

    std::map<std::string, std::size_t, std::less<>> hits; ///< by call
};

} // namespace project::test

#pragma once

#include <string>
#include <utility>
#include <vector>

#include "stores/merge_matrix/ProjectChanges.hpp"

namespace project::test {

/// The content of a text with sorted nested nodes, one address per line.
std::string contentOf(std::string const& text);

/// The expected results of merging any two changes.
class ExpectedMerges {
public:
    ExpectedMerges();

    /// The description of the conflict of two changes; empty if they merge without a conflict.
    static std::string conflict(std::string const& ours, std::string const& theirs);

    /// The pairs of names that these tables list as exceptions.
    static std::vector<std::pair<std::string, std::string>> exceptions();

    /// Fails the test unless a merged text equals the result of both changes in one project, one after the
    /// other, in each order that the managers allow.
    void expectBoth(std::string const& merged, NamedChange const& one, NamedChange const& other) const;

    SampleProject const& project() const noexcept { return project_; }

    /// The version that all changes start from.
    std::string const& common() const noexcept { return common_; }

private:
    bool expectAfter(std::string const& merged, NamedChange const& first, NamedChange const& second) const;

    SampleProject project_;
    std::string common_;
};

} // namespace project::test

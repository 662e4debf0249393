#pragma once

#include <string>
#include <utility>
#include <vector>

namespace projectctl {

/// A text that a shell offers for a word, and its description, which has neither tabs nor line ends.
struct Candidate {
    std::string value;
    std::string description;
};

/// The candidates for a word: those that begin with the part of it that was typed.
class Candidates {
public:
    explicit Candidates(std::string typed) : typed_(std::move(typed)) {}

    std::string const& typed() const noexcept { return typed_; }

    /// Adds a candidate if it begins with the typed text.
    void add(std::string value, std::string description);

    std::vector<Candidate> const& all() const noexcept { return all_; }

private:
    std::string typed_;
    std::vector<Candidate> all_;
};

} // namespace projectctl

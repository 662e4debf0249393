#pragma once

#include <iterator>
#include <string>
#include <utility>
#include <vector>

namespace projectctl {

/// A fault or a note about a project's definition.
struct Finding {
    enum class Weight {
        Note,  ///< useful to know, and harmless
        Fault, ///< a part of the definition cannot be used without a correction
    };

    Weight weight;
    std::string text; ///< one clause in UTF-8, which names its subject

    static Finding fault(std::string text) { return {Weight::Fault, std::move(text)}; }

    static Finding note(std::string text) { return {Weight::Note, std::move(text)}; }
};

using Findings = std::vector<Finding>;

inline void append(Findings& findings, Findings more) {
    findings.insert(findings.end(), std::make_move_iterator(more.begin()),
                    std::make_move_iterator(more.end()));
}

} // namespace projectctl

#pragma once

#include <iterator>
#include <string>
#include <utility>
#include <vector>

namespace projectctl {

/// Something in a project's definition that somebody should know.
struct Finding {
    enum class Weight {
        Note,  ///< nobody is misled by it
        Fault, ///< what the definition says cannot be used as it stands
    };

    Weight weight;
    std::string text; ///< one clause in UTF-8, which names what it is about

    static Finding fault(std::string text) { return {Weight::Fault, std::move(text)}; }

    static Finding note(std::string text) { return {Weight::Note, std::move(text)}; }
};

using Findings = std::vector<Finding>;

inline void append(Findings& findings, Findings more) {
    findings.insert(findings.end(), std::make_move_iterator(more.begin()),
                    std::make_move_iterator(more.end()));
}

} // namespace projectctl

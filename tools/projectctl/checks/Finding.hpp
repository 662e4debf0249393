#pragma once

#include <cstddef>
#include <iterator>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "checks/FindingCode.hpp"
#include "project/metadata/MetadataPath.hpp"
#include "texts/Message.hpp"

namespace projectctl {

/// A fault or a note about a project's definition.
struct Finding {
    enum class Weight {
        Note,  ///< useful to know, and harmless
        Fault, ///< a part of the definition cannot be used without a correction
    };

    Weight weight;
    std::string_view code;    ///< of FindingCode.hpp
    std::string text;         ///< one clause in UTF-8, which names its subject
    std::u16string path = {}; ///< of the file that it is about, relative to the root; empty if there is none
    std::optional<project::metadata::MetadataPath> address = {}; ///< of its node; empty if there is none
    std::size_t line = 0; ///< of the text, counted from 1; 0 if it has none, or until placeInText was called

    static Finding fault(std::string_view code, Message const& message) {
        return {Weight::Fault, code, message.text()};
    }

    static Finding note(std::string_view code, Message const& message) {
        return {Weight::Note, code, message.text()};
    }

    bool isFault() const noexcept { return weight == Weight::Fault; }

    Finding at(project::metadata::MetadataPath where) && {
        address = std::move(where);
        return std::move(*this);
    }

    Finding about(std::u16string_view file) && {
        path = file;
        return std::move(*this);
    }
};

using Findings = std::vector<Finding>;

inline void append(Findings& findings, Findings more) {
    findings.insert(findings.end(), std::make_move_iterator(more.begin()),
                    std::make_move_iterator(more.end()));
}

} // namespace projectctl

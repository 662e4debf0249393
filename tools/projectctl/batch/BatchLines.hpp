#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "project/ProjectCommand.hpp"

namespace projectctl {

/// A command of a batch, parsed.
struct BatchLine {
    std::size_t number; ///< of the line in which it begins, from 1
    std::unique_ptr<ProjectCommand> command;
};

/// Parses a whole batch, so that nothing runs if a line of it cannot.
/// @param text in the form of CommandText.
/// @throws WrongUse for the first line that cannot be parsed, or whose command cannot be part of a batch.
std::vector<BatchLine> parseBatch(std::string text, CommandList const& commands);

} // namespace projectctl

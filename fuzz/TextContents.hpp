#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>

#include "text/ProjectText.hpp"

namespace project::fuzz {

/// What stands at each address, as the line that a writer writes for it.
using Contents = std::map<stores::Address, std::string>;

/// Walks through all that a text has; children must be sorted, hold something, and have something below them
/// if and only if they say so.
Contents contentsOf(stores::ProjectText const& text);

/// The same of a part of what is kept, by any way to ask for children.
std::string lineOf(stores::Address const& address, stores::Node const& node);

/// A text with these lines in its body, and its tail behind them if there is one.
std::string framed(std::string_view lines, std::string_view tail = {});

/// Nothing for bytes that are no text: refused, or incomplete.
std::optional<stores::ProjectText> readText(std::string bytes);

/// What holds for every text that can be read: it says the same again once it is written, in one form.
void checkText(stores::ProjectText const& text, std::string_view bytes);

} // namespace project::fuzz

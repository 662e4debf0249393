#pragma once

#include <string>
#include <utility>
#include <vector>

namespace projectctl {

/// A text of texts/page in the language of the process, in UTF-8, with its placeholders {0}, {1}, ...
std::string pageText(std::string const& name);

/// All texts of the page by their names, in the order of the catalog.
std::vector<std::pair<std::string, std::string>> pageTexts();

} // namespace projectctl

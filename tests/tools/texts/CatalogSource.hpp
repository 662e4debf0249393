#pragma once

#include "support/CatalogSource.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {

/// The texts of a source of a catalog of the tool by their names.
inline std::map<std::string, std::string> readTexts(std::string const& catalog, std::string const& language) {
    return readCatalog(std::filesystem::path(PROJECTCTL_SOURCES) / "texts" / catalog / (language + ".txt"));
}

} // namespace project::test

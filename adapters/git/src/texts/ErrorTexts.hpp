#pragma once

#include "fl/i18n/TextTable.hpp"

namespace project::git {

/// The texts of the errors of source control by git, compiled from the catalogs in this folder.
extern fl::i18n::TextTable const errorTexts;

} // namespace project::git

#pragma once

#include "fl/i18n/TextTable.hpp"

namespace project::postgresql {

/// The texts of the errors of shared projects in PostgreSQL, compiled from the catalogs in this folder.
extern fl::i18n::TextTable const errorTexts;

} // namespace project::postgresql

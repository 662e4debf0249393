#pragma once

#include "fl/i18n/TextTable.hpp"

namespace project::stores {

/// The texts of the errors of the stores, compiled from the catalogs in this folder.
extern fl::i18n::TextTable const errorTexts;

} // namespace project::stores

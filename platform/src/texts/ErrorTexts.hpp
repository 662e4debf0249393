#pragma once

#include "fl/i18n/TextTable.hpp"

namespace fl::i18n {

/// The texts of the errors of the platform, compiled from the catalogs in this folder.
extern TextTable const errorTexts;

} // namespace fl::i18n

#pragma once

#include "fl/i18n/TextTable.hpp"

namespace project::session {

/// The texts of the errors of the session, compiled from the catalogs in this folder.
extern fl::i18n::TextTable const errorTexts;

} // namespace project::session

#pragma once

#include <string>

namespace projectctl {

/// The locale that the environment asks for texts: LC_ALL, else LC_MESSAGES, else LANG, without the encoding
/// ("de_AT" for "de_AT.UTF-8"); "en" when there is none.
std::string languageOfEnvironment();

} // namespace projectctl

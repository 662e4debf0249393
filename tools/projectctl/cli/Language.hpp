#pragma once

#include <string>

namespace projectctl {

/// The locale of messages that the environment sets: LC_ALL, else LC_MESSAGES, else LANG, without the
/// encoding
/// ("de_AT" for "de_AT.UTF-8"); "en" when none of them is set.
std::string languageOfEnvironment();

} // namespace projectctl

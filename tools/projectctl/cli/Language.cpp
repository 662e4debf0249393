#include "cli/Language.hpp"

#include <cstdlib>

namespace projectctl {

std::string languageOfEnvironment() {
    for (auto const* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
        auto const* value = std::getenv(variable);
        if (value != nullptr && *value != '\0') { // an empty one counts as not set
            std::string const locale(value);
            std::string const language = locale.substr(0, locale.find_first_of(".@"));
            return language.empty() || language == "C" || language == "POSIX" ? "en" : language;
        }
    }
    return "en";
}

} // namespace projectctl

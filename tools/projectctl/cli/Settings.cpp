#include "cli/Settings.hpp"

namespace projectctl {

Settings& settings() {
    static Settings chosen;
    return chosen;
}

} // namespace projectctl

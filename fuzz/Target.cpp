#include "Target.hpp"

namespace project::fuzz {

std::vector<Target>& targets() {
    static std::vector<Target> all;
    return all;
}

Registration::Registration(char const* name, void (*run)(std::string_view input)) {
    targets().push_back({name, run});
}

} // namespace project::fuzz

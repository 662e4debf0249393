#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace project::fuzz {

/// Something that must hold for every input, and the code that looks whether it does.
struct Target {
    char const* name;

    /// Throws BrokenLaw, or lets a sanitizer speak, when the input shows that it does not hold.
    void (*run)(std::string_view input);
};

/// All targets of this program, in no order.
std::vector<Target>& targets();

/// Adds a target to those of the program, before main.
class Registration {
public:
    Registration(char const* name, void (*run)(std::string_view input));
};

/// An input for which something does not hold.
class BrokenLaw : public std::logic_error {
public:
    using logic_error::logic_error;
};

/// @param law what must hold, a clause. @throws BrokenLaw when it does not.
inline void require(bool holds, char const* law) {
    if (!holds) {
        throw BrokenLaw(std::string("it does not hold that ") + law);
    }
}

} // namespace project::fuzz

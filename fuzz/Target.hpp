#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace project::fuzz {

/// A law that must hold for every input, and the code that checks it.
struct Target {
    char const* name;

    /// @throws BrokenLaw if the input shows that the law does not hold.
    void (*run)(std::string_view input);
};

/// All targets of this program, in any order.
std::vector<Target>& targets();

/// Adds a target to those of the program, before main.
class Registration {
public:
    Registration(char const* name, void (*run)(std::string_view input));
};

/// An input for which a law does not hold.
class BrokenLaw : public std::logic_error {
public:
    using logic_error::logic_error;
};

/// @param law the condition as a clause. @throws BrokenLaw if it does not hold.
inline void require(bool holds, char const* law) {
    if (!holds) {
        throw BrokenLaw(std::string("this law does not hold: ") + law);
    }
}

} // namespace project::fuzz

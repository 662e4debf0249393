#pragma once

#include <cstdlib>
#include <string>

namespace project::test {

/// Sets a variable in the environment of this process for the lifetime of the object.
class EnvironmentVariable {
public:
    EnvironmentVariable(char const* name, std::string const& value) : name_(name) {
        ::setenv(name, value.c_str(), 1);
    }

    ~EnvironmentVariable() { ::unsetenv(name_); }

    EnvironmentVariable(EnvironmentVariable const&) = delete;
    EnvironmentVariable& operator=(EnvironmentVariable const&) = delete;

private:
    char const* name_;
};

} // namespace project::test

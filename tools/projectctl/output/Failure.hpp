#pragma once

#include <stdexcept>

namespace projectctl {

/// An error that the tool itself detects. The text is one clause or sentence in UTF-8 for the user.
class Failure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

} // namespace projectctl

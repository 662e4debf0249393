#pragma once

#include <stdexcept>

namespace projectctl {

/// What the tool itself cannot do. The text is one clause or sentence in UTF-8 for the person at the
/// terminal.
class Failure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

} // namespace projectctl

#pragma once

#include <stdexcept>

#include "texts/Message.hpp"

namespace projectctl {

/// An error that the tool itself detects. The text is one clause or sentence in UTF-8 for the user.
class Failure : public std::runtime_error {
public:
    explicit Failure(Message const& message) : std::runtime_error(message.text()) {}
};

} // namespace projectctl

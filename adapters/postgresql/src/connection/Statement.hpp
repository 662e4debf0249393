#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace project::postgresql {

/// A statement with its parameters as $1, $2 and so on. Each of them has a cast in the text, so that its type
/// does not depend on the context.
struct Statement {
    char const*
        name; ///< the connection prepares the statement under this name; empty for one that is used once
    char const* text;
};

/// A value for a parameter.
struct Parameter {
    std::string_view bytes; ///< valid until the call was sent
    bool isBinary = false;  ///< for bytea; everything else is sent as text
};

/// A statement with values.
struct Call {
    Statement statement;
    std::vector<Parameter> parameters;
};

} // namespace project::postgresql

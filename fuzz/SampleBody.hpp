#pragma once

#include <string>

#include "TextInput.hpp"

namespace project::fuzz {

/// A body with some files, a folder, labels, a project name and a created address: the text before the
/// batches of an input.
inline std::string const& sampleBody() {
    static std::string const body = framed(R"("a"
"a/"
"a/b"
{"file":"a/c","children":[{"type":"Category","keys":{"UUID":"1"},"children":[{"type":"Label","keys":{"UUID":"2"}}]}]}
"b"
{"at":["Info","ProjectData"],"keys":{"Name":"x"}}
{"at":["References","Root"],"node":false}
)");
    return body;
}

} // namespace project::fuzz

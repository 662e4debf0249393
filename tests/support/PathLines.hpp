#pragma once

#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"

namespace project::test {

/// Something that happened to some paths, as one line: its name, and each path's text after a space.
inline std::u16string line(std::u16string name, std::vector<fl::filesystem::Path> const& paths) {
    for (auto const& path : paths) {
        name += u" " + path.native();
    }
    return name;
}

} // namespace project::test

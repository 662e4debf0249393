#pragma once

#include <functional>
#include <string_view>

#include "project/metadata/MetadataPath.hpp"

namespace projectctl {

/// A file that is checked. Most files have no findings, so that its address is created on request.
struct CheckedFile {
    std::u16string_view path; ///< relative to the root
    std::function<project::metadata::MetadataPath()> address;
};

} // namespace projectctl

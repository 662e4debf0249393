#pragma once

#include "project/session/FileKind.hpp"

namespace projectctl {

/// The kind of a file system entry.
using Kind = project::session::FileKind;

} // namespace projectctl

#pragma once

#include <string_view>

#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

/// The word for the subject of a change in a document, for example "entryPoint".
std::u16string_view wordFor(project::stores::DefinitionChange::Subject subject);

/// The word for the kind of a change in a document, for example "added".
std::u16string_view wordFor(project::stores::DefinitionChange::Kind kind);

} // namespace projectctl

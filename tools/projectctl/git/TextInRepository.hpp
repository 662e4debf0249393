#pragma once

namespace projectctl {

/// The path of a project's text from the root of the project, as git writes it.
inline constexpr char const* textBelowRoot = ".projectdata/project.jsonl";

} // namespace projectctl

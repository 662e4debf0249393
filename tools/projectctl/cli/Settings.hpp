#pragma once

namespace projectctl {

/// The options that every command accepts.
struct Settings {
    bool sourceControl = true; ///< false: the tool does not use git
    bool usesPager = true;
    bool showsFullNames = false; ///< show paths relative to the root instead of the current folder
};

/// Set when the command line is parsed.
Settings& settings();

} // namespace projectctl

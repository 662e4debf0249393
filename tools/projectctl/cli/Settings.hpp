#pragma once

namespace projectctl {

/// What the person who calls has chosen for whatever command.
struct Settings {
    bool sourceControl = true; ///< else git is left alone
};

/// Set while the command line is read.
Settings& settings();

} // namespace projectctl

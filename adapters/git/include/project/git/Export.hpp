#pragma once

/// Exports a symbol from the shared library project::git.
#define PROJECT_GIT_EXPORT __attribute__((visibility("default")))

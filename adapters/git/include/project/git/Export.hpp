#pragma once

/// Marks what the shared library project::git shows to others.
#define PROJECT_GIT_EXPORT __attribute__((visibility("default")))

#pragma once

/// Marks the symbols that the shared library project::platform exports. All others are hidden.
#define PROJECT_PLATFORM_EXPORT __attribute__((visibility("default")))

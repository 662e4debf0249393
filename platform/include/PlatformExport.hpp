#pragma once

/// Marks what the shared library project::platform shows to others; everything else stays inside it.
#define PROJECT_PLATFORM_EXPORT __attribute__((visibility("default")))

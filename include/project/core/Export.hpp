#pragma once

/// Marks what the shared library project::management shows to others.
#define PROJECT_MANAGEMENT_EXPORT __attribute__((visibility("default")))

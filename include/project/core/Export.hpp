#pragma once

/// Marks the symbols that the shared library project::management exports.
#define PROJECT_MANAGEMENT_EXPORT __attribute__((visibility("default")))

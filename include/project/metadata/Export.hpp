#pragma once

/// Marks the symbols that the shared library project::metadata exports.
#define PROJECT_METADATA_EXPORT __attribute__((visibility("default")))

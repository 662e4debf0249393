#pragma once

/// Marks what the shared library project::metadata shows to others.
#define PROJECT_METADATA_EXPORT __attribute__((visibility("default")))

#pragma once

/// Marks what the shared library project::stores shows to others.
#define PROJECT_STORES_EXPORT __attribute__((visibility("default")))

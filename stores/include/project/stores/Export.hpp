#pragma once

/// Marks the classes and functions that the shared library project::stores exports.
#define PROJECT_STORES_EXPORT __attribute__((visibility("default")))

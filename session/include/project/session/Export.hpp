#pragma once

/// Marks the classes and functions that the shared library project::session exports.
#define PROJECT_SESSION_EXPORT __attribute__((visibility("default")))

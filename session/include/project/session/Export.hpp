#pragma once

/// Marks what the shared library project::session shows to others.
#define PROJECT_SESSION_EXPORT __attribute__((visibility("default")))

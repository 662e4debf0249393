#pragma once

/// Exports a symbol from the shared library project::postgresql.
#define PROJECT_POSTGRESQL_EXPORT __attribute__((visibility("default")))

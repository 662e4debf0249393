#pragma once

#include <CLI/CLI.hpp>

namespace projectctl {

/// Declares the option `--similarity`, in percent.
CLI::Option* declareSimilarity(CLI::App& app, int& similarity);

} // namespace projectctl

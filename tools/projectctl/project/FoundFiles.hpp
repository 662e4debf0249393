#pragma once

#include <CLI/CLI.hpp>

#include "project/FileList.hpp"

namespace projectctl {

/// Writes the files that a query finds to standard output: one path per line, or as the caller of the tool
/// chose.
class FoundFiles {
public:
    /// Declares the options --json and -0, and --tree if the command has it.
    void declare(CLI::App& app, bool hasTree);

    void write(OpenProject& project, FileList const& files, project::session::Query const& query) const;

private:
    void writePaths(OpenProject& project, FileList const& files, project::session::Query const& query) const;

    bool isTree_ = false;
    bool isJson_ = false;
    bool isNullEnded_ = false;
};

} // namespace projectctl

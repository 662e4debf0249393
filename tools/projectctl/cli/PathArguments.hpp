#pragma once

#include <string>
#include <vector>

#include <CLI/CLI.hpp>

#include "cli/Completes.hpp"
#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// The files and folders that a command works on: from the arguments and from standard input.
class PathArguments {
public:
    /// Declares the arguments, at least one, and the option -0. Parsing them claims standard input if they
    /// say that it contains paths.
    /// @param things the paths that a shell offers.
    void declare(CLI::App& app, Completes things = Completes::ProjectPaths);

    /// The paths, absolute, in the given order. Reads standard input if the arguments say so.
    /// @throws Failure for an empty path.
    std::vector<Path> read() const;

private:
    bool readsInput() const;

    std::vector<std::string> arguments_;
    bool isNull_ = false;
};

/// The absolute path of one argument, in the form of the project's root. Relative paths start from the
/// current folder.
/// @throws Failure for an empty argument.
Path absolutePath(std::string const& argument);

/// The same for several arguments.
std::vector<Path> absolutePaths(std::vector<std::string> const& arguments);

} // namespace projectctl

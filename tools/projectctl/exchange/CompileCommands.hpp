#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// An entry of a compilation database.
struct CompiledFile {
    std::size_t line = 0;  ///< in which the entry begins, from 1
    std::string directory; ///< absolute
    std::string file;      ///< absolute, or relative to the directory
    std::string output;    ///< the object file, in the same way; empty if it is not known
};

/// Reads a compilation database: compile_commands.json.
/// @throws Failure if it is not one.
std::vector<CompiledFile> readCompileCommands(std::string_view text);

/// The folder of the target that an object file belongs to, with the target's name if CMake has built it:
/// "src/engine" for "src/CMakeFiles/engine.dir/main.cpp.o", and "obj/engine" for "obj/engine/main.o". Empty
/// if there is none.
std::string targetFolderOf(std::string_view output);

} // namespace projectctl

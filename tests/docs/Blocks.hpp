#pragma once

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "project/session.hpp"

/// Runs the C++ blocks of the documentation.
namespace docs {

/// Runs a block in a new folder, which is the working folder meanwhile, with an open project in it.
/// @return the text that the block has written to std::cout.
std::string runBlock(void (*block)(project::session::Session&));

/// Runs a whole program in a new folder. The test fails if its exit code is not 0.
/// @return the text that the program has written to std::cout.
std::string runProgram(int (*program)(int, char**), std::vector<std::string> arguments);

} // namespace docs

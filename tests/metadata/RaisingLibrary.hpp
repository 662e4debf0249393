#pragma once

#include <typeinfo>

/// A shared library with hidden visibility that raises errors, as those of the managers do.
namespace project::test {

__attribute__((visibility("default"))) void raisePlain();
__attribute__((visibility("default"))) void raiseNested();

/// The class information of both as that library has it.
__attribute__((visibility("default"))) std::type_info const& plainType();
__attribute__((visibility("default"))) std::type_info const& nestedType();

} // namespace project::test

#pragma once

#include <typeinfo>

/// A shared library with hidden visibility that raises errors, like that of the managers.
namespace project::test {

__attribute__((visibility("default"))) void raisePlain();
__attribute__((visibility("default"))) void raiseNested();

/// The type information of both in that library.
__attribute__((visibility("default"))) std::type_info const& plainType();
__attribute__((visibility("default"))) std::type_info const& nestedType();

} // namespace project::test

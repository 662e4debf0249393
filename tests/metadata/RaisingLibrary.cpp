#include "metadata/RaisingLibrary.hpp"

#include <stdexcept>

#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"

namespace project::test {

using exception::Raised;
using ZEPHRA::project::management::FileNotInProject;

void raisePlain() {
    exception::raise(FileNotInProject(u"/a/file"));
}

void raiseNested() {
    try {
        throw std::out_of_range("no such key");
    } catch (std::out_of_range const&) {
        exception::raise(FileNotInProject(u"/a/file"));
    }
}

std::type_info const& plainType() {
    return typeid(Raised<FileNotInProject>);
}

std::type_info const& nestedType() {
    return typeid(std::_Nested_exception<Raised<FileNotInProject>>);
}

} // namespace project::test

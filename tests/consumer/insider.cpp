// A test of somebody else's that looks inside the library needs nothing but the one target.
#include "files/FileManagerBase.hpp"
#include "project/management.hpp"

int main() {
    project::management::FileManagerBase const files(u"/nowhere", nullptr);
    return project::metadata::generateUUID().size() == 36 ? 0 : 1;
}

// What an application does with the installed library: a project in memory, one error caught, one text read.
#include <cstdio>
#include <memory>

#include <project/management.hpp>
#include <project/stores/MemoryBackend.hpp>
#include <project/stores/TreeMetadataManager.hpp>

int main() {
    namespace stores = project::stores;
    auto store = std::make_shared<stores::TreeMetadataManager>(std::make_unique<stores::MemoryBackend>(),
                                                               u"/nowhere/.projectdata");
    project::management::ProjectManagerBase manager(u"/nowhere", store);
    manager.create(u"consumer");
    try {
        manager.getFileManager().add({u"/nowhere/missing"});
    } catch (project::exception::ProjectException const& error) {
        std::printf("%s\n", error.what());
        return manager.getName() == u"consumer" ? 0 : 1;
    }
    return 1;
}

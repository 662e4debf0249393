#include "cm/InternalCMAwareProjectManager.hpp"

#include <utility>

namespace project::management {

InternalCMAwareProjectManager::InternalCMAwareProjectManager(std::unique_ptr<ProjectManager> inner,
                                                             cmlink::CMAdapter& adapter)
    : ProjectManagerDecorator(std::move(inner)),
      adapter_(adapter),
      handler_(std::make_shared<CMProjectFileEventHandler>(
          adapter_, ProjectManagerDecorator::getFileManager().getProjectRoot())),
      fileManager_(ProjectManagerDecorator::getFileManager(), *handler_) {
    ProjectManagerDecorator::subscribe(handler_);
}

FileManager& InternalCMAwareProjectManager::getFileManager() {
    return fileManager_;
}

NotedFiles InternalCMAwareProjectManager::exchangeNotedFiles(NotedFiles files) {
    return handler_->exchangeNoted(std::move(files));
}

} // namespace project::management

#include "project/cm/CMAwareProjectManager.hpp"

#include <utility>

#include "cm/InternalCMAwareProjectManager.hpp"

namespace project::management {

CMAwareProjectManager::CMAwareProjectManager(std::unique_ptr<ProjectManager> inner,
                                             cmlink::CMAdapter& adapter)
    : CMAwareProjectManager(
          std::make_unique<InternalCMAwareProjectManager>(std::move(inner), adapter).release()) {
}

CMAwareProjectManager::CMAwareProjectManager(InternalCMAwareProjectManager* inner)
    : ProjectManagerDecorator(std::unique_ptr<ProjectManager>(inner)), inner_(*inner) {
}

NotedFiles CMAwareProjectManager::exchangeNotedFiles(NotedFiles files) {
    return inner_.exchangeNotedFiles(std::move(files));
}

CMAwareProjectManager::~CMAwareProjectManager() = default;

} // namespace project::management

#include "project/cm/CMAwareProjectManager.hpp"

#include <utility>

#include "cm/InternalCMAwareProjectManager.hpp"

namespace project::management {

CMAwareProjectManager::CMAwareProjectManager(std::unique_ptr<ProjectManager> inner,
                                             cmlink::CMAdapter& adapter)
    : ProjectManagerDecorator(std::make_unique<InternalCMAwareProjectManager>(std::move(inner), adapter)) {
}

CMAwareProjectManager::~CMAwareProjectManager() = default;

} // namespace project::management

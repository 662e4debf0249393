#pragma once

#include <memory>

#include "cm/CMAwareFileManager.hpp"
#include "cm/CMProjectFileEventHandler.hpp"
#include "cmlink/CMAdapter.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

/// What CMAwareProjectManager wraps: the project together with what keeps source control in step with it.
///
/// Apart from the public class, so that what that one is made of can change without its users noticing. The
/// base must own the project before the decorator is made on its file manager.
class InternalCMAwareProjectManager : public ProjectManagerDecorator {
public:
    InternalCMAwareProjectManager(std::unique_ptr<ProjectManager> inner, cmlink::CMAdapter& adapter);

    FileManager& getFileManager() override;

private:
    cmlink::CMAdapter& adapter_;
    std::shared_ptr<CMProjectFileEventHandler> handler_; // the store holds it weakly
    CMAwareFileManager fileManager_;
};

} // namespace project::management

#pragma once

#include <memory>

#include "cm/CMAwareFileManager.hpp"
#include "cm/CMProjectFileEventHandler.hpp"
#include "cmlink/CMAdapter.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

/// The state of CMAwareProjectManager: the project, its file manager's decorator and the listener on the
/// store.
///
/// Deliberately a class of its own: it can change without changing the public class. The base class must
/// own the project before the decorator of its file manager is created.
class InternalCMAwareProjectManager : public ProjectManagerDecorator {
public:
    InternalCMAwareProjectManager(std::unique_ptr<ProjectManager> inner, cmlink::CMAdapter& adapter);

    FileManager& getFileManager() override;
    NotedFiles exchangeNotedFiles(NotedFiles files);

private:
    cmlink::CMAdapter& adapter_;
    std::shared_ptr<CMProjectFileEventHandler> handler_; // the store holds only a weak pointer
    CMAwareFileManager fileManager_;
};

} // namespace project::management

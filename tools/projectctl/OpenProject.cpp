#include "OpenProject.hpp"

#include <utility>

#include "Output.hpp"
#include "ProjectFolder.hpp"

namespace projectctl {

using project::management::ProjectManagerBase;
using project::stores::Fault;
using project::stores::TextBackend;
using project::stores::TreeMetadataManager;

OpenProject::OpenProject(Path root) : root_(std::move(root)), shield_(std::make_shared<WriteShield>()) {
    auto text = std::make_unique<TextBackend>(project::stores::makeSystemDisk(root_));
    text_ = text.get();
    store_ = std::make_shared<TreeMetadataManager>(std::move(text), root_ / TextBackend::folderName);
    store_->subscribe(shield_);
    manager_ = std::make_unique<ProjectManagerBase>(root_, store_);
}

OpenProject::~OpenProject() = default;

OpenProject OpenProject::ofWorkingFolder() {
    return OpenProject(findProjectRoot(workingFolder()));
}

std::string OpenProject::textFile() const {
    return shown(root_ / TextBackend::folderName / TextBackend::textName);
}

std::string OpenProject::storeFile(std::string const& name) const {
    return shown(root_ / TextBackend::folderName) + '/' + name;
}

void OpenProject::warnOfDamage() {
    std::size_t count = 0;
    std::string first;
    for (auto const& fault : text_->check()) {
        if (fault.kind == Fault::Kind::Damage || fault.kind == Fault::Kind::Conflict) {
            if (count++ == 0) {
                first = textFile() + ':' + std::to_string(fault.line) + ": " + fault.problem;
            }
        }
    }
    if (count > 0) {
        printError("warning: " + first + (count > 1 ? ", and " + std::to_string(count - 1) + " more" : "") +
                   ". 'projectctl check' tells more.");
    }
}

} // namespace projectctl

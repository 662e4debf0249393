#include "project/metadata/Messages.hpp"

#include "fl/i18n/MessageCatalog.hpp"

/// The compiled texts of messages/, which the build embeds in this library.
extern "C" __attribute__((visibility("hidden"))) unsigned char const project_management_messages[];

namespace ZEPHRA::project::management {

std::string const& projectCatalog() {
    // Never destroyed: errors may be raised while static objects are destroyed.
    static auto const& name = []() -> std::string const& {
        auto const& catalog = *new std::string("ZEPHRA:project:management");
        fl::i18n::MessageCatalog::registerCatalog(catalog, "project_management_messages",
                                                  project_management_messages);
        return catalog;
    }();
    return name;
}

::resource_core::BaseMsgID entryPointGroupDefaultName() {
    return {projectCatalog(), "EntryPointGroupDefaultName", 0};
}

} // namespace ZEPHRA::project::management

#include "entrypoints/EntryPointGroupBase.hpp"

#include "entrypoints/Schema.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "project/metadata/Messages.hpp"

namespace project::management {

EntryPointGroupBase::EntryPointGroupBase(std::u16string const& name, std::u16string const& uuid)
    : EntryPointGroupDefinition(name, uuid) {
}

std::unique_ptr<EntryPointGroup> getDefaultGroup() {
    static std::u16string const name =
        fl::i18n::MessageCatalog::get_message(ZEPHRA::project::management::entryPointGroupDefaultName());
    return std::make_unique<EntryPointGroupBase>(name, entrypoints::DEFAULT_GROUP_UUID);
}

} // namespace project::management

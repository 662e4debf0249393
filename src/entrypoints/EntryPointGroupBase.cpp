#include "entrypoints/EntryPointGroupBase.hpp"

#include "fl/i18n/MessageCatalog.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

EntryPointGroupBase::EntryPointGroupBase(std::u16string const& name, std::u16string const& uuid)
    : EntryPointGroupDefinition(name, uuid) {
}

std::unique_ptr<EntryPointGroup> getDefaultGroup() {
    static std::u16string const name =
        fl::i18n::MessageCatalog::get_message(ZEPHRA::project::management::entryPointGroupDefaultName());
    return std::make_unique<EntryPointGroupBase>(name, schema::entrypoints::defaultGroupUUID);
}

} // namespace project::management

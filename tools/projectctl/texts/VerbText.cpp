#include "texts/VerbText.hpp"

#include "fl/i18n/MessageCatalog.hpp"
#include "fl/i18n/Utf8.hpp"
#include "resource_core/BaseMsgID.hpp"

/// The compiled texts of verbs/, which the build embeds in the tool.
extern "C" __attribute__((visibility("hidden"))) unsigned char const projectctl_verbs[];

namespace projectctl {

std::string verbText(std::string const& name) {
    using fl::i18n::MessageCatalog;
    static constexpr char const* catalogName = "projectctl:verbs";
    MessageCatalog::registerCatalog(catalogName, "projectctl_verbs", projectctl_verbs);
    auto const text =
        fl::i18n::toUtf8(MessageCatalog::get_message(resource_core::BaseMsgID(catalogName, name, 0)));
    return text == name ? std::string()
                        : text; // the catalog returns the name of a text that it does not have
}

} // namespace projectctl

#include "texts/Message.hpp"

#include "fl/i18n/MessageCatalog.hpp"
#include "fl/i18n/Utf8.hpp"

/// The compiled texts of messages/, which the build embeds in the tool.
extern "C" __attribute__((visibility("hidden"))) unsigned char const projectctl_messages[];

namespace projectctl {

std::string Message::text() const {
    using fl::i18n::MessageCatalog;
    MessageCatalog::registerCatalog(catalogName, "projectctl_messages", projectctl_messages);
    return fl::i18n::toUtf8(MessageCatalog::get_message(*this));
}

} // namespace projectctl

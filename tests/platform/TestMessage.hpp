#pragma once

#include <cstddef>
#include <string>
#include <utility>

#include "fl/i18n/MessageCatalog.hpp"
#include "resource_core/BaseMsgID.hpp"

/// The compiled texts of tests/platform/messages, which the build embeds in the test program.
extern "C" __attribute__((visibility("hidden"))) unsigned char const platform_test_messages[];

namespace project::test {

/// A message of the test catalog, with any arguments.
class TestMessage : public resource_core::BaseMsgID {
public:
    template <class... Arguments>
    explicit TestMessage(std::string name, Arguments const&... arguments)
        : BaseMsgID(catalog(), std::move(name), sizeof...(arguments)) {
        std::size_t slot = 0;
        (setArgument(slot++, arguments), ...);
    }

private:
    static std::string catalog() {
        fl::i18n::MessageCatalog::registerCatalog("test:platform", "platform_test_messages",
                                                  platform_test_messages);
        return "test:platform";
    }
};

} // namespace project::test

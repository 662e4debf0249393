#include <atomic>
#include <thread>

#include "fl/i18n/MessageCatalog.hpp"
#include "platform/TestMessage.hpp"
#include "support/GlobalLocale.hpp"

namespace fl::i18n {
namespace {

TEST(MessageCatalogConcurrency, everyTextIsCompleteWhileAnotherThreadChangesTheLanguage) {
    project::test::GlobalLocale const restored("en");
    std::atomic<int> foreign = 0;
    std::vector<std::thread> readers;
    for (int i = 0; i < 4; ++i) {
        readers.emplace_back([&foreign] {
            for (long n = 0; n < 500; ++n) {
                auto const text = MessageCatalog::get_message(project::test::TestMessage("Count", 7L));
                foreign += text != u"7 files" && text != u"7 Dateien" ? 1 : 0;
            }
        });
    }

    for (int i = 0; i < 500; ++i) {
        MessageCatalog::setGlobalLocale(i % 2 == 0 ? "de" : "en");
    }
    for (auto& reader : readers) {
        reader.join();
    }

    EXPECT_EQ(foreign, 0);
}

} // namespace
} // namespace fl::i18n

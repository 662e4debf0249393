#pragma once

#include <string>
#include <utility>

#include "fl/i18n/MessageCatalog.hpp"

namespace project::test {

/// Sets the global locale. The destructor restores the earlier one.
class GlobalLocale {
public:
    explicit GlobalLocale(std::string locale) {
        fl::i18n::MessageCatalog::setGlobalLocale(std::move(locale));
    }

    GlobalLocale(GlobalLocale const&) = delete;
    GlobalLocale& operator=(GlobalLocale const&) = delete;

    ~GlobalLocale() { fl::i18n::MessageCatalog::setGlobalLocale(before_); }

private:
    std::string before_ = fl::i18n::MessageCatalog::getGlobalLocale();
};

} // namespace project::test

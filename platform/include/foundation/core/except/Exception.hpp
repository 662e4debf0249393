#pragma once

#include <string>

#include "PlatformExport.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "fl/i18n/Utf8.hpp"
#include "foundation/core/except/IMsgIDException.hpp"
#include "resource_core/BaseMsgID.hpp"

namespace foundation::core::except {

/// The exception for one class of messages: combines the message with a base that derives from
/// std::exception.
///
/// It can be caught as itself, as Base, as std::exception and through the interfaces. Its type information is
/// visible if that of M and Base is, so that it can be caught across libraries.
///
/// @tparam M the message's class, which derives from resource_core::BaseMsgID and is copyable.
/// @tparam Base a copyable class with a virtual what().
/// @tparam Enable void; for specialisations.
template <class M, class Base, class Enable = void>
class PROJECT_PLATFORM_EXPORT Exception : public IMsgIDException, public Base {
public:
    /// Copies both. The text of what() is created here, because what() must not fail later.
    Exception(Base const& base, M const& message)
        : Base(base),
          message_(message),
          errorId_(get_error_id(message)),
          what_(fl::i18n::toUtf8(fl::i18n::MessageCatalog::get_message(message))) {}

    Exception* clone() const override { return new Exception(*this); }

    [[noreturn]] void rethrow() const override { throw Exception(*this); }

    ~Exception() override = default;

    char const* what() const noexcept override { return what_.c_str(); }

    void convert_str(std::u16string& text) const override { text = GetUnicodeMessageTxt(); }

    void convert_str(std::string& text) const override { text = fl::i18n::toUtf8(GetUnicodeMessageTxt()); }

    std::u16string ToUstringImpl() const override { return GetUnicodeMessageTxt(); }

    std::string GetID() const override { return errorId_; }

    std::u16string GetUnicodeMessageTxt() const override {
        return fl::i18n::MessageCatalog::get_message(message_);
    }

    resource_core::BaseMsgID const& GetBaseMsgIDObj() const override { return message_; }

private:
    M message_;
    std::string errorId_;
    std::string what_;
};

} // namespace foundation::core::except

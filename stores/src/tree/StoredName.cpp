#include "tree/StoredName.hpp"

#include <algorithm>
#include <cstring>

namespace project::stores {

namespace {

/// Without a branch in the loop, so that the compiler can use vector instructions.
bool fitsInBytes(std::u16string_view text) noexcept {
    unsigned all = 0;
    for (char16_t const unit : text) {
        all |= unit;
    }
    return all <= 0xFF;
}

void copyNarrow(std::u16string_view text, char* out) noexcept {
    std::transform(text.begin(), text.end(), out, [](char16_t unit) { return static_cast<char>(unit); });
}

char16_t unitAt(StoredName const& name, std::size_t index) noexcept {
    if (!name.isWide) {
        return static_cast<unsigned char>(name.bytes[index]);
    }
    char16_t unit = 0;
    std::memcpy(&unit, name.bytes.data() + index * sizeof unit, sizeof unit);
    return unit;
}

std::size_t lengthOf(StoredName const& name) noexcept {
    return name.isWide ? name.bytes.size() / sizeof(char16_t) : name.bytes.size();
}

} // namespace

std::u16string StoredName::text() const {
    if (!isWide) {
        auto const* const begin = reinterpret_cast<unsigned char const*>(bytes.data());
        return {begin, begin + bytes.size()};
    }
    std::u16string text(bytes.size() / sizeof(char16_t), u'\0');
    std::memcpy(text.data(), bytes.data(), bytes.size());
    return text;
}

NewName::NewName(std::u16string_view text) noexcept : text_(text), isWide_(!fitsInBytes(text)) {
}

void NewName::copyTo(char* out) const noexcept {
    if (isWide_) {
        std::memcpy(out, text_.data(), size());
    } else {
        copyNarrow(text_, out);
    }
}

bool NameKey::hasNarrowForm() const noexcept {
    if (form_ == Form::Unknown) {
        bool const isNarrow = text_.size() <= longestNarrow && fitsInBytes(text_);
        form_ = isNarrow ? Form::Narrow : Form::Other;
        if (isNarrow) {
            copyNarrow(text_, narrow_);
        }
    }
    return form_ == Form::Narrow;
}

bool NameKey::isEqual(StoredName const& stored) const noexcept {
    if (text_.size() != lengthOf(stored)) {
        return false;
    }
    if (stored.isWide) {
        return std::memcmp(text_.data(), stored.bytes.data(), stored.bytes.size()) == 0;
    }
    unsigned different = 0; // without a branch in the loop, as in fitsInBytes
    for (std::size_t i = 0; i < text_.size(); ++i) {
        different |= static_cast<unsigned>(text_[i]) ^ static_cast<unsigned char>(stored.bytes[i]);
    }
    return different == 0;
}

std::strong_ordering NameKey::compareWith(StoredName const& stored) const noexcept {
    std::size_t const length = std::min(text_.size(), lengthOf(stored));
    if (!stored.isWide && hasNarrowForm()) {
        int const order = length == 0 ? 0 : std::memcmp(narrow_, stored.bytes.data(), length);
        return order != 0 ? order <=> 0 : text_.size() <=> stored.bytes.size();
    }
    for (std::size_t i = 0; i < length; ++i) {
        if (auto const unit = unitAt(stored, i); text_[i] != unit) {
            return text_[i] <=> unit;
        }
    }
    return text_.size() <=> lengthOf(stored);
}

} // namespace project::stores

#include "tree/StoredName.hpp"

#include <algorithm>
#include <array>
#include <cstring>

namespace project::stores {

namespace {

/// Loops over so many units without a branch, so that the compiler uses vector instructions.
constexpr std::size_t block = 8;

bool fitsInBytes(std::u16string_view text) noexcept {
    unsigned all = 0;
    auto const* unit = text.data();
    auto const* const end = unit + text.size();
    for (; end - unit >= std::ptrdiff_t{block}; unit += block) {
        unsigned ofBlock = 0;
        for (std::size_t i = 0; i < block; ++i) {
            ofBlock |= unit[i];
        }
        all |= ofBlock;
    }
    for (; unit != end; ++unit) {
        all |= *unit;
    }
    return all <= 0xFF;
}

void copyNarrow(std::u16string_view text, char* out) noexcept {
    auto const* unit = text.data();
    auto const* const end = unit + text.size();
    for (; end - unit >= std::ptrdiff_t{block}; unit += block, out += block) {
        for (std::size_t i = 0; i < block; ++i) {
            out[i] = static_cast<char>(unit[i]);
        }
    }
    for (; unit != end; ++unit, ++out) {
        *out = static_cast<char>(*unit);
    }
}

/// Compares texts of the same length from the end: names in one folder often begin alike.
bool isEqualNarrow(std::u16string_view text, std::string_view bytes) noexcept {
    std::size_t left = text.size();
    for (; left >= block; left -= block) {
        std::array<char16_t, block> units;
        for (std::size_t i = 0; i < block; ++i) {
            units[i] = static_cast<unsigned char>(bytes[left - block + i]);
        }
        if (std::memcmp(units.data(), text.data() + left - block, sizeof units) != 0) {
            return false;
        }
    }
    while (left > 0 && text[left - 1] == static_cast<unsigned char>(bytes[left - 1])) {
        --left;
    }
    return left == 0;
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
    return isEqualNarrow(text_, stored.bytes);
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

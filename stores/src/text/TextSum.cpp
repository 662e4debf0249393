#include "text/TextSum.hpp"

#include <new>
#include <xxhash.h>

#include "text/TextLines.hpp"

namespace project::stores {

TextSum::TextSum() : state_(XXH3_createState()) {
    if (state_ == nullptr) {
        throw std::bad_alloc();
    }
    XXH3_128bits_reset(state_);
}

TextSum::~TextSum() {
    XXH3_freeState(state_);
}

void TextSum::add(std::string_view line) noexcept {
    XXH3_128bits_update(state_, line.data(), line.size());
}

void TextSum::addLines(std::string_view text) noexcept {
    LineWalk lines(text, 0, 1);
    while (lines.next()) {
        add(lines.line().text);
    }
}

std::string TextSum::hex() const {
    XXH128_canonical_t canonical;
    XXH128_canonicalFromHash(&canonical, XXH3_128bits_digest(state_));
    constexpr char digits[] = "0123456789abcdef";
    std::string text;
    for (unsigned char const byte : canonical.digest) {
        text += digits[byte >> 4];
        text += digits[byte & 0xF];
    }
    return text;
}

} // namespace project::stores

#pragma once

#include <compare>
#include <cstddef>
#include <string>
#include <string_view>

namespace project::stores {

/// A view of the name of an entry: one byte for each code unit if all are below 256, otherwise two.
struct StoredName {
    std::string_view bytes;
    bool isWide;

    std::u16string text() const;
};

/// The name of an entry, as it will be stored.
class NewName {
public:
    explicit NewName(std::u16string_view text) noexcept;

    bool isWide() const noexcept { return isWide_; }

    /// The number of bytes that it takes.
    std::size_t size() const noexcept { return isWide_ ? sizeof(char16_t) * text_.size() : text_.size(); }

    /// Writes its bytes.
    void copyTo(char* out) const noexcept;

private:
    std::u16string_view text_;
    bool isWide_;
};

/// A name that is compared with stored ones. The text must outlive it.
class NameKey {
public:
    explicit NameKey(std::u16string_view text) noexcept : text_(text) {}

    NameKey(NameKey const&) = delete;
    NameKey& operator=(NameKey const&) = delete;

    std::u16string_view text() const noexcept { return text_; }

    bool isEqual(StoredName const& stored) const noexcept;

    /// The order of this name and a stored one, by code units.
    std::strong_ordering compareWith(StoredName const& stored) const noexcept;

private:
    static constexpr std::size_t longestNarrow = 128;

    enum class Form { Unknown, Narrow, Other };

    /// Tries to create the narrow form. @return false if a unit does not fit, or if the name is long.
    bool hasNarrowForm() const noexcept;

    std::u16string_view text_;
    mutable Form form_ = Form::Unknown;
    mutable char narrow_[longestNarrow]; // NOLINT: not initialised, since that would cost more than a search
};

} // namespace project::stores

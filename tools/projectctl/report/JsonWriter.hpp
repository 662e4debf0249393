#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace projectctl {

/// Writes compact JSON for a script element of an HTML page: no text contains "<", so that none can end the
/// element. A surrogate without its partner is escaped.
class JsonWriter {
public:
    void beginObject() { begin('{'); }

    void endObject() { end('}'); }

    void beginArray() { begin('['); }

    void endArray() { end(']'); }

    /// Begins a member of an object. Its value is next. @param key plain ASCII.
    void key(std::string_view key);

    void text(std::u16string_view value);

    /// @param value UTF-8; bytes that are not valid UTF-8 are preserved, as in a name on disk.
    void text(std::string_view value);

    void number(std::uint64_t value);
    void flag(bool value);
    void null();

    template <class Value>
    void member(std::string_view name, Value const& value) {
        key(name);
        text(value);
    }

    void numberMember(std::string_view name, std::uint64_t value) {
        key(name);
        number(value);
    }

    void flagMember(std::string_view name, bool value) {
        key(name);
        flag(value);
    }

    /// Writes a member that is an array of one object for each item.
    /// @param writeMembers is called with each item, and writes the members of its object.
    template <class Items, class WriteMembers>
    void objectsMember(std::string_view name, Items const& items, WriteMembers writeMembers) {
        key(name);
        beginArray();
        for (auto const& item : items) {
            beginObject();
            writeMembers(item);
            endObject();
        }
        endArray();
    }

    std::string const& bytes() const noexcept { return bytes_; }

private:
    void begin(char bracket);
    void end(char bracket);
    void separate();

    std::string bytes_;
    bool needsComma_ = false;
};

} // namespace projectctl

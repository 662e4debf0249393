#include "report/JsonWriter.hpp"

#include "fl/i18n/JsonString.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

void JsonWriter::key(std::string_view key) {
    separate();
    bytes_ += '"';
    bytes_ += key;
    bytes_ += "\":";
    needsComma_ = false;
}

void JsonWriter::text(std::u16string_view value) {
    separate();
    std::size_t const begin = bytes_.size();
    fl::i18n::appendJsonString(bytes_, value, fl::i18n::JsonEscapes::Controls);
    for (auto at = bytes_.find('<', begin); at != std::string::npos; at = bytes_.find('<', at)) {
        bytes_.replace(at, 1, "\\u003c");
    }
}

void JsonWriter::text(std::string_view value) {
    text(textOf(std::string(value)));
}

void JsonWriter::number(std::uint64_t value) {
    separate();
    bytes_ += std::to_string(value);
}

void JsonWriter::flag(bool value) {
    separate();
    bytes_ += value ? "true" : "false";
}

void JsonWriter::null() {
    separate();
    bytes_ += "null";
}

void JsonWriter::begin(char bracket) {
    separate();
    bytes_ += bracket;
    needsComma_ = false;
}

void JsonWriter::end(char bracket) {
    bytes_ += bracket;
    needsComma_ = true;
}

void JsonWriter::separate() {
    bytes_ += needsComma_ ? "," : "";
    needsComma_ = true;
}

} // namespace projectctl

#include "output/JsonObject.hpp"

#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

void JsonObject::begin() {
    output().text() += '{';
    isFirstMember_ = true;
}

void JsonObject::addText(std::string_view key, std::u16string_view text) {
    addKey(key);
    appendJsonString(output().text(), text);
}

void JsonObject::addList(std::string_view key, std::vector<std::u16string> const& texts) {
    addKey(key);
    auto& out = output().text();
    out += '[';
    for (auto const& text : texts) {
        out += out.back() == '[' ? "" : ", ";
        appendJsonString(out, text);
    }
    out += ']';
}

void JsonObject::addTexts(std::string_view key, Texts const& texts) {
    addKey(key);
    auto& out = output().text();
    out += '{';
    for (auto const& [name, text] : texts) {
        out += out.back() == '{' ? "" : ", ";
        appendJsonString(out, name);
        out += ": ";
        appendJsonString(out, text);
    }
    out += '}';
}

void JsonObject::addFlag(std::string_view key, bool value) {
    addKey(key);
    output().text() += value ? "true" : "false";
}

void JsonObject::addNumber(std::string_view key, std::size_t value) {
    addKey(key);
    output().text() += std::to_string(value);
}

void JsonObject::addFile(std::u16string_view path, Kind kind) {
    addText("path", path);
    addText("kind", kind == Kind::Folder ? u"folder" : u"file");
}

void JsonObject::end() {
    output().text() += '}';
}

void JsonObject::addKey(std::string_view key) {
    auto& out = output().text();
    out += isFirstMember_ ? "\"" : ", \"";
    out += key;
    out += "\": ";
    isFirstMember_ = false;
}

} // namespace projectctl

#include "JsonRows.hpp"

#include "NameForms.hpp"
#include "Output.hpp"

namespace projectctl {

void JsonRows::begin() {
    output().text() += isEmpty_ ? "[\n{" : "},\n{";
    output().settle();
    isEmpty_ = false;
    isFirstMember_ = true;
}

void JsonRows::addText(std::string_view key, std::u16string_view text) {
    addKey(key);
    appendJsonString(output().text(), text);
}

void JsonRows::addTexts(std::string_view key, Texts const& texts) {
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

void JsonRows::addFlag(std::string_view key, bool value) {
    addKey(key);
    output().text() += value ? "true" : "false";
}

void JsonRows::addFile(std::u16string_view path, Kind kind) {
    addText("path", path);
    addText("kind", kind == Kind::Folder ? u"folder" : u"file");
}

void JsonRows::finish() {
    output().text() += isEmpty_ ? "[]" : "}\n]";
}

void JsonRows::finishOutput() {
    finish();
    output().text() += '\n';
}

void JsonRows::addKey(std::string_view key) {
    auto& out = output().text();
    out += isFirstMember_ ? "\"" : ", \"";
    out += key;
    out += "\": ";
    isFirstMember_ = false;
}

} // namespace projectctl

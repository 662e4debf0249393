#include "watch/EventLines.hpp"

#include "output/JsonFormat.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

/// The fields of a line.
struct Line {
    std::string_view event;
    std::vector<std::u16string> data;
};

void writeLine(Line const& line) {
    auto& out = output().text();
    out += line.event;
    for (std::u16string const& text : line.data) {
        std::string bytes;
        appendBytes(bytes, text);
        out += '\t';
        appendQuoted(out, bytes);
    }
    out += '\n';
}

JsonObject beginJson(std::string_view event) {
    JsonObject object;
    object.begin();
    object.addText("event", std::u16string(event.begin(), event.end()));
    return object;
}

void endJson(JsonObject& object) {
    object.end();
    output().text() += '\n';
}

template <typename Identifier>
void addNamed(JsonObject& object, std::string_view key, Identifier const& identifier) {
    object.addNamed(key, identifier.getName(), identifier.getUUID());
}

} // namespace

EventLines::EventLines(OpenProject& project, bool asJson)
    : shown_(asJson ? ShownPaths::fromRoot(project.root()) : ShownPaths(project.root())), asJson_(asJson) {
    using Files = std::vector<Path>;
    auto& events = project.events();
    events.onFileListUpdate([this](Files const& files) { writeFiles("fileListUpdate", files); });
    events.onFileLabelsChanged([this](Files const& files) { writeFiles("fileLabelsChanged", files); });
    events.onCategoryAdded(
        [this](CategoryIdentifier const& category) { writeCategory("categoryAdded", category); });
    events.onCategoryRenamed(
        [this](CategoryIdentifier const& category) { writeCategory("categoryRenamed", category); });
    events.onCategoryDeleted(
        [this](CategoryIdentifier const& category) { writeCategory("categoryDeleted", category); });
    events.onLabelModified([this](Label const& label) { writeLabel(label); });
    events.onEntryPointsChanged([this] { write("entryPointsChanged"); });
    events.onNameChanged([this] { write("nameChanged"); });
    events.onPathChanged([this] { write("pathChanged"); });
    events.onReferencesChanged([this] { write("referencesChanged"); });
    events.onMetadataChange([this] { write("metadataChange"); });
}

void EventLines::writeReady() const {
    auto const version = static_cast<std::size_t>(json::watch.version);
    if (asJson_) {
        auto object = beginJson("ready");
        object.addText("format", std::u16string(json::watch.name.begin(), json::watch.name.end()));
        object.addNumber("version", version);
        endJson(object);
    } else {
        output().text() += "ready\t" + std::to_string(version) + '\n';
    }
}

void EventLines::write(std::string_view event) {
    if (asJson_) {
        auto object = beginJson(event);
        endJson(object);
    } else {
        writeLine({event, {}});
    }
}

void EventLines::writeFiles(std::string_view event, std::vector<Path> const& files) {
    std::vector<std::u16string> names;
    names.reserve(files.size());
    for (auto const& file : files) {
        names.emplace_back(shown_.ofAbsolute(file));
    }
    if (asJson_) {
        auto object = beginJson(event);
        object.addList("files", names);
        endJson(object);
    } else {
        writeLine({event, std::move(names)});
    }
}

void EventLines::writeCategory(std::string_view event, CategoryIdentifier const& category) {
    if (asJson_) {
        auto object = beginJson(event);
        addNamed(object, "category", category);
        endJson(object);
    } else {
        writeLine({event, {category.getName()}});
    }
}

void EventLines::writeLabel(Label const& label) {
    constexpr std::string_view event = "labelModified";
    if (asJson_) {
        auto object = beginJson(event);
        addNamed(object, "category", label.getCategory());
        addNamed(object, "label", label.getLabelIdentifier());
        endJson(object);
    } else {
        writeLine({event, {label.getCategory().getName(), label.getLabelIdentifier().getName()}});
    }
}

} // namespace projectctl

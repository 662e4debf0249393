#include "watch/EventLines.hpp"

#include <string>
#include <string_view>
#include <vector>

#include "cli/ShownPaths.hpp"
#include "output/JsonFormat.hpp"
#include "output/JsonObject.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

template <typename Identifier>
void addNamed(JsonObject& object, std::string_view key, Identifier const& identifier) {
    object.addNamed(key, identifier.getName(), identifier.getUUID());
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

} // namespace

/// Writes the events of one layer.
class EventLines::OfLayer {
public:
    OfLayer(OpenProject& project, project::management::ProjectEventBroadcaster& events, bool isPersonal,
            bool asJson);
    OfLayer(OfLayer const&) = delete;
    OfLayer& operator=(OfLayer const&) = delete;

private:
    using CategoryIdentifier = project::management::CategoryIdentifier;
    using Label = project::management::Label;

    void write(std::string_view event);
    void writeFiles(std::string_view event, std::vector<Path> const& files);
    void writeCategory(std::string_view event, CategoryIdentifier const& category);
    void writeLabel(Label const& label);
    void writeLine(std::string_view event, std::vector<std::u16string> const& data) const;
    void finish(JsonObject& object) const;

    ShownPaths shown_;
    bool isPersonal_;
    bool asJson_;
};

EventLines::OfLayer::OfLayer(OpenProject& project, project::management::ProjectEventBroadcaster& events,
                             bool isPersonal, bool asJson)
    : shown_(asJson ? ShownPaths::fromRoot(project.root()) : ShownPaths(project.root())),
      isPersonal_(isPersonal),
      asJson_(asJson) {
    using Files = std::vector<Path>;
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

void EventLines::OfLayer::writeLine(std::string_view event, std::vector<std::u16string> const& data) const {
    auto& out = output().text();
    out += isPersonal_ ? "personal " : "";
    out += event;
    for (std::u16string const& text : data) {
        std::string bytes;
        appendBytes(bytes, text);
        out += '\t';
        appendQuoted(out, bytes);
    }
    out += '\n';
}

void EventLines::OfLayer::finish(JsonObject& object) const {
    if (isPersonal_) {
        object.addFlag("personal", true);
    }
    endJson(object);
}

void EventLines::OfLayer::write(std::string_view event) {
    if (asJson_) {
        auto object = beginJson(event);
        finish(object);
    } else {
        writeLine(event, {});
    }
}

void EventLines::OfLayer::writeFiles(std::string_view event, std::vector<Path> const& files) {
    std::vector<std::u16string> names;
    names.reserve(files.size());
    for (auto const& file : files) {
        names.emplace_back(shown_.ofAbsolute(file));
    }
    if (asJson_) {
        auto object = beginJson(event);
        object.addList("files", names);
        finish(object);
    } else {
        writeLine(event, names);
    }
}

void EventLines::OfLayer::writeCategory(std::string_view event, CategoryIdentifier const& category) {
    if (asJson_) {
        auto object = beginJson(event);
        addNamed(object, "category", category);
        finish(object);
    } else {
        writeLine(event, {category.getName()});
    }
}

void EventLines::OfLayer::writeLabel(Label const& label) {
    constexpr std::string_view event = "labelModified";
    if (asJson_) {
        auto object = beginJson(event);
        addNamed(object, "category", label.getCategory());
        addNamed(object, "label", label.getLabelIdentifier());
        finish(object);
    } else {
        writeLine(event, {label.getCategory().getName(), label.getLabelIdentifier().getName()});
    }
}

EventLines::EventLines(OpenProject& project, bool asJson)
    : project_(std::make_unique<OfLayer>(project, project.events(), false, asJson)),
      personal_(std::make_unique<OfLayer>(project, *project.personal().events(), true, asJson)),
      asJson_(asJson) {
}

EventLines::~EventLines() = default;

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

} // namespace projectctl

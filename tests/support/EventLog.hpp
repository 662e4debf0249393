#pragma once

#include <string>
#include <utility>
#include <vector>

#include "project/decorators/ProjectEventBroadcaster.hpp"
#include "project/labels/Label.hpp"
#include "support/PathLines.hpp"

namespace project::test {

/// Observes every event of a broadcaster and writes each down as one line: its name and its arguments. A
/// path is written as its text, a category as its UUID and name, a label as the UUIDs of its category and
/// itself.
///
/// Must outlive the last event.
class EventLog {
public:
    explicit EventLog(management::ProjectEventBroadcaster& broadcaster) {
        using Paths = std::vector<management::Path>;
        using Category = management::CategoryIdentifier;
        broadcaster.onFileListUpdate([this](Paths const& files) { note(line(u"fileListUpdate", files)); });
        broadcaster.onMetadataChange([this] { note(u"metadataChange"); });
        broadcaster.onLabelModified([this](management::Label const& label) {
            note(u"labelModified " + label.getCategory().getUUID() + u" " + label.getUUID());
        });
        broadcaster.onCategoryDeleted(
            [this](Category const& category) { note(categoryLine(u"categoryDeleted", category)); });
        broadcaster.onCategoryAdded(
            [this](Category const& category) { note(categoryLine(u"categoryAdded", category)); });
        broadcaster.onCategoryRenamed(
            [this](Category const& category) { note(categoryLine(u"categoryRenamed", category)); });
        broadcaster.onFileLabelsChanged(
            [this](Paths const& files) { note(line(u"fileLabelsChanged", files)); });
        broadcaster.onEntryPointsChanged([this] { note(u"entryPointsChanged"); });
        broadcaster.onNameChanged([this] { note(u"nameChanged"); });
        broadcaster.onPathChanged([this] { note(u"pathChanged"); });
        broadcaster.onReferencesChanged([this] { note(u"referencesChanged"); });
    }

    EventLog(EventLog const&) = delete;
    EventLog& operator=(EventLog const&) = delete;

    /// Writes down something else that happens, in order with the events.
    void note(std::u16string text) { lines_.push_back(std::move(text)); }

    /// A function that writes this text down, for use as a mock's action.
    auto noting(std::u16string text) {
        return [this, text = std::move(text)](auto const&...) { note(text); };
    }

    /// All lines since the last call.
    std::vector<std::u16string> take() { return std::exchange(lines_, {}); }

private:
    static std::u16string categoryLine(std::u16string const& name,
                                       management::CategoryIdentifier const& category) {
        return name + u" " + category.getUUID() + u" " + category.getName();
    }

    std::vector<std::u16string> lines_;
};

} // namespace project::test

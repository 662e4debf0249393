#include "entrypoints/EntryRows.hpp"

#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

void EntryRows::add(project::management::EntryPoint const& entry) {
    rows_.begin();
    rows_.addText("path", project::metadata::getRelativePath(root_, entry.getFile()));
    rows_.addText("uuid", entry.getUUID());
    rows_.addText("type", toString(entry.getType()));
    rows_.addText("name", entry.getName());
    rows_.addFlag("visible", entry.isVisible());
    if (auto const group = entry.getGroup()) {
        rows_.addNamed("group", group->getName(), group->getUUID());
    }
    JsonRows::Texts extensions;
    for (auto const& key : entry.getExtensionKeys()) {
        extensions.emplace_back(key, entry.getExtensionData(key).value_or(u""));
    }
    rows_.addTexts("extensions", extensions);
}

} // namespace projectctl

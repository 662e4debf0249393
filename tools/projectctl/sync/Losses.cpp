#include "sync/Losses.hpp"

#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace categorySchema = project::metadata::schema::categories;

using project::metadata::MetadataPath;
using project::metadata::PathElement;
using project::session::LabelChoice;
using project::session::RemovedFile;

void Losses::warn() {
    for (auto const& removed : plan_.removed) {
        if (removed.isAnythingLost()) {
            printWarning(Message("SyncLoss", shown_.ofAbsolute(removed.file.path), described(removed)));
        }
    }
}

std::string Losses::described(RemovedFile const& file) const {
    std::string result;
    auto const add = [&result](std::string const& text) { result += (result.empty() ? "" : ", ") + text; };
    for (auto const& label : labelsOf(file)) {
        add(Message("SyncLostLabel", label).text());
    }
    for (auto const& entryPoint : file.entryPoints) {
        add(Message("SyncLostEntry", entryPoint).text());
    }
    return result;
}

std::vector<std::u16string> Losses::labelsOf(RemovedFile const& file) const {
    std::vector<std::u16string> result;
    for (auto const& label : file.labels) {
        result.push_back(nameOf(label));
    }
    return result;
}

/// A UUID in place of a name that is not there any more.
std::u16string Losses::nameOf(LabelChoice const& label) const {
    auto const nameAt = [this](MetadataPath const& address, std::u16string const& uuid) {
        auto const node = project_.store().getNode(address);
        auto const name = node ? node->get(categorySchema::labelNameKey) : std::u16string();
        return name.empty() ? uuid : name;
    };
    auto const category =
        MetadataPath::root()
            .child(PathElement(categorySchema::categoriesType, project::metadata::schema::rootLocation))
            .child(PathElement(categorySchema::categoryType, label.categoryUUID));
    return nameAt(category, label.categoryUUID) + u'=' +
           nameAt(category.child(PathElement(categorySchema::labelType, label.labelUUID)), label.labelUUID);
}

} // namespace projectctl

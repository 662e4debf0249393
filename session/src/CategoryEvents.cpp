#include "CategoryEvents.hpp"

#include <map>
#include <memory>

#include "project/stores/MemoryBackend.hpp"

namespace project::session {

using management::CategoryIdentifier;
using management::Label;
using management::Path;
using metadata::MetadataManager;
using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using stores::Difference;

namespace {

using Broadcaster = management::DispatchableProjectEventBroadcaster;

/// How many elements the addresses of categories and of labels have.
constexpr std::size_t categoryDepth = 2;
constexpr std::size_t labelDepth = 3;

/// The nodes at the differences before the changes, and the unchanged categories of labels that differ.
std::map<MetadataPath, std::shared_ptr<MetadataNode>> nodesBefore(std::vector<Difference> const& differences,
                                                                  MetadataManager& now) {
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> nodes;
    for (auto const& [address, before, after] : differences) {
        auto const category = address.parent();
        if (address.depth() == labelDepth && now.hasNode(category)) {
            nodes.try_emplace(category, now.getNode(category));
        }
    }
    for (auto const& [address, before, after] : differences) {
        nodes.erase(address);
        if (before) {
            nodes.emplace(address, std::make_shared<MetadataNodeSpecification>(*before));
        }
    }
    return nodes;
}

std::shared_ptr<MetadataManager> storeBefore(std::vector<Difference> const& differences,
                                             MetadataManager& now) {
    auto store = std::make_shared<stores::TreeMetadataManager>(std::make_unique<stores::MemoryBackend>(),
                                                               now.getMetadataRoot());
    auto nodes = nodesBefore(differences, now);
    store->setNodes(nodes);
    return store;
}

bool isSameButForTheName(CategoryIdentifier const& left, CategoryIdentifier const& right) {
    return left.isReadOnly() == right.isReadOnly() && left.isSingleValued() == right.isSingleValued() &&
           left.getDataType() == right.getDataType();
}

} // namespace

CategoryEvents::CategoryEvents(std::vector<Difference> const& differences,
                               std::shared_ptr<MetadataManager> const& store, Path const& root)
    : store_(store), before_(root, storeBefore(differences, *store)), now_(root, store) {
    for (auto const& difference : differences) {
        try {
            add(difference);
        } catch (exception::ProjectException const&) {
            hasUnreported_ = true;
        }
    }
}

CategoryEvents::~CategoryEvents() = default;

void CategoryEvents::add(Difference const& difference) {
    auto const depth = difference.address.depth();
    if (depth == categoryDepth) {
        addCategory(difference);
    } else if (depth == labelDepth) {
        addLabel(difference);
    } else {
        hasUnreported_ = true;
    }
}

void CategoryEvents::addCategory(Difference const& difference) {
    auto const uuid = difference.address.getLeaf().getLocation();
    auto const in = [&uuid](management::ProjectManagerBase& project) {
        return project.getLabelManager().getCategoryByUUID(uuid);
    };
    if (!difference.after) {
        events_.emplace_back([was = in(before_)](Broadcaster& to) { to.dispatchCategoryDeleted(was); });
    } else if (!difference.before) {
        events_.emplace_back([is = in(now_)](Broadcaster& to) { to.dispatchCategoryAdded(is); });
    } else if (auto const was = in(before_), is = in(now_); !isSameButForTheName(was, is)) {
        // A category gets other flags by being created again under the same UUID.
        events_.emplace_back([is](Broadcaster& to) { to.dispatchCategoryAdded(is); });
    } else if (was.getName() != is.getName()) {
        events_.emplace_back([was](Broadcaster& to) { to.dispatchCategoryRenamed(was); });
    } else {
        hasUnreported_ = true;
    }
}

/// Labels that were deleted together with their category raise no event, as when the category is deleted
/// here.
void CategoryEvents::addLabel(Difference const& difference) {
    auto const category = difference.address.parent();
    if (!difference.after && !store_->hasNode(category)) {
        return;
    }
    auto& labels = (difference.after ? now_ : before_).getLabelManager();
    auto const itsCategory = labels.getCategoryByUUID(category.getLeaf().getLocation());
    Label const label(itsCategory,
                      labels.getLabelByUUID(itsCategory, difference.address.getLeaf().getLocation()));
    events_.emplace_back([label](Broadcaster& to) { to.dispatchLabelModified(label); });
}

} // namespace project::session

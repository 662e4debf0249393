#include "ChangeEvents.hpp"

#include <set>
#include <utility>

#include "CategoryEvents.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::session {

namespace schema = metadata::schema;

using management::DispatchableProjectEventBroadcaster;
using management::Path;
using management::ProjectManagerBase;
using stores::Changes;
using stores::Difference;

namespace {

using Broadcaster = DispatchableProjectEventBroadcaster;

/// Sorts differences by the event that reports them.
class Sorting {
public:
    Sorting(Path const& root, FileEvents fileEvents) : root_(root), fileEvents_(fileEvents) {}

    void take(Difference const& difference);

    /// Counts everything that has no event of its own as changed.
    void takeRest() { rest_ = true; }

    std::vector<Difference> const& categories() const noexcept { return categories_; }

    /// @param ofCategories are placed after the event of the name.
    std::vector<Event> events(std::vector<Event> ofCategories) const;

private:
    void takeName(Difference const& difference);
    void takeFile(Difference const& difference);

    Path const& root_;
    FileEvents fileEvents_;
    bool name_ = false;
    std::vector<Difference> categories_;
    std::set<Path> files_;
    std::set<Path> labelled_;
    bool entryPoints_ = false;
    bool path_ = false;
    bool references_ = false;
    bool rest_ = false;
};

void Sorting::take(Difference const& difference) {
    auto const& head = difference.address[0];
    auto const& type = head.getType();
    if (difference.address == ProjectManagerBase::getRootNodePath()) {
        takeName(difference);
    } else if (type == schema::files::filesType && head.getLocation() == schema::files::fileListScope) {
        takeFile(difference);
    } else if (type == schema::categories::categoriesType) {
        categories_.push_back(difference);
    } else if (type == schema::entrypoints::entryPointsType || type == schema::entrypoints::groupsType) {
        entryPoints_ = true;
    } else if (type == schema::references::projectPathType) {
        path_ = true;
    } else if (type == schema::references::referencesType) {
        references_ = true;
    } else {
        rest_ = true;
    }
}

void Sorting::takeName(Difference const& difference) {
    auto const nameOf = [](stores::Node const& node) {
        return node ? node->get(ProjectManagerBase::NAME_FIELD) : std::u16string();
    };
    bool const isName = nameOf(difference.before) != nameOf(difference.after);
    (isName ? name_ : rest_) = true;
}

/// A file is stored at its own address, a folder at its marker. Addresses below these belong to their
/// labels.
void Sorting::takeFile(Difference const& difference) {
    auto const& address = difference.address;
    auto path = root_;
    std::size_t index = 1;
    for (; index < address.depth() && address[index].getType() == schema::files::fileType; ++index) {
        path = path / Path(address[index].getLocation());
    }
    bool const isMarker =
        index + 1 == address.depth() && address[index].getType() == schema::files::markerType;
    bool const isItself = index == address.depth() || isMarker;
    bool const isAddedOrRemoved = isItself && (difference.before == nullptr) != (difference.after == nullptr);
    auto const hasLabels = [](stores::Node const& node) { return node && !node->getChildren().empty(); };
    bool const isListed = fileEvents_ == FileEvents::All;
    if (isAddedOrRemoved && isListed) {
        files_.insert(files_.end(), path); // the differences are sorted, except for unusual names
    }
    if (!isAddedOrRemoved || hasLabels(difference.after) || (!isListed && hasLabels(difference.before))) {
        labelled_.insert(path);
    }
}

std::vector<Event> Sorting::events(std::vector<Event> ofCategories) const {
    std::vector<Event> events;
    auto const add = [&events](bool isDue, Event event) {
        if (isDue) {
            events.push_back(std::move(event));
        }
    };
    add(name_, [](Broadcaster& to) { to.dispatchNameChanged(); });
    std::move(ofCategories.begin(), ofCategories.end(), std::back_inserter(events));
    add(!files_.empty(), [files = std::vector<Path>(files_.begin(), files_.end())](Broadcaster& to) {
        to.dispatchOnFileListUpdate(files);
    });
    add(!labelled_.empty(), [files = std::vector<Path>(labelled_.begin(), labelled_.end())](Broadcaster& to) {
        to.dispatchFileLabelsChanged(files);
    });
    add(entryPoints_, [](Broadcaster& to) { to.dispatchEntryPointsChanged(); });
    add(path_, [](Broadcaster& to) { to.dispatchPathChanged(); });
    add(references_, [](Broadcaster& to) { to.dispatchReferencesChanged(); });
    add(rest_, [](Broadcaster& to) { to.dispatchMetadataChange(); });
    return events;
}

} // namespace

std::vector<Event> eventsOf(Changes const& changes, std::shared_ptr<metadata::MetadataManager> const& store,
                            Path const& root, FileEvents fileEvents) {
    Sorting sorting(root, fileEvents);
    for (auto const& difference : changes.differences) {
        sorting.take(difference);
    }
    CategoryEvents categories(sorting.categories(), store, root);
    if (changes.everything || categories.hasUnreported()) {
        sorting.takeRest();
    }
    return sorting.events(categories.take());
}

} // namespace project::session

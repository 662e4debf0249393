#include "report/Definition.hpp"

#include <utility>

#include "output/Failure.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "text/ProjectText.hpp"

namespace projectctl {

namespace schema = project::metadata::schema;

using project::metadata::MetadataNode;
using project::metadata::MetadataPath;
using project::metadata::PathElement;
using project::stores::Child;
using project::stores::ChildCollector;
using project::stores::Children;

namespace {

/// Reads one definition. Folders are read from a stack and not recursively: other people decide how deep they
/// are.
class DefinitionReader {
public:
    explicit DefinitionReader(ChildSource const& source) : source_(source) {}

    Definition read() {
        readInformation();
        readFiles();
        readCategories();
        readEntryPoints();
        readReferences(schema::references::referencesType, result_.references);
        readReferences(schema::references::projectPathType, result_.projectPath);
        return std::move(result_);
    }

private:
    struct Folder {
        MetadataPath address;
        std::size_t entry; ///< index of the entry; of the root, the number of entries
        Children children;
        std::size_t next = 0;
    };

    static constexpr auto noEntry = static_cast<std::size_t>(-1);

    Children childrenOf(MetadataPath const& address) const {
        ChildCollector children;
        source_(address, children);
        return children.take();
    }

    Children childrenOf(char16_t const* type, char16_t const* location = schema::rootLocation) const {
        return childrenOf(MetadataPath::root().child(PathElement(type, location)));
    }

    template <class Visitor>
    void visit(Children const& children, std::u16string_view type, Visitor const& visitor) const {
        for (auto const& child : children) {
            if (child.element.getType() == type && child.node) {
                visitor(child.element.getLocation(), *child.node);
            }
        }
    }

    void readInformation() {
        visit(childrenOf(MetadataPath::root()), schema::information::nameType,
              [this](std::u16string const& location, MetadataNode const& node) {
                  if (location == schema::information::nameLocation) {
                      result_.name = node.get(schema::information::nameKey);
                  }
              });
        visit(childrenOf(schema::information::extensionsType, schema::information::extensionsLocation),
              schema::information::descriptionType,
              [this](std::u16string const& location, MetadataNode const& node) {
                  if (location == schema::information::descriptionLocation) {
                      result_.description = node.get(schema::information::descriptionKey);
                  }
              });
    }

    void readFiles() {
        enter(MetadataPath::root().child(PathElement(schema::files::filesType, schema::files::fileListScope)),
              noEntry);
        while (!folders_.empty()) {
            auto& folder = folders_.back();
            if (folder.next == folder.children.size()) {
                folders_.pop_back();
            } else {
                add(folder.children[folder.next++]);
            }
        }
    }

    void enter(MetadataPath const& address, std::size_t entry) {
        folders_.push_back({address, entry, childrenOf(address)});
    }

    void add(Child const& child) {
        auto const& folder = folders_.back();
        if (child.element.getType() == schema::files::markerType && folder.entry != noEntry) {
            result_.entries[folder.entry].kind = Kind::Folder;
        }
        if (child.element.getType() != schema::files::fileType || !child.node) {
            return;
        }
        auto const& name = child.element.getLocation();
        result_.entries.push_back(
            {folder.entry == noEntry ? name : result_.entries[folder.entry].path + u'/' + name, Kind::File,
             countedLabels(*child.node)});
        if (child.hasChildren) {
            enter(folder.address.child(child.element), result_.entries.size() - 1);
        }
    }

    /// A label without a UUID does not count, as in queries.
    static LabelsOnFile countedLabels(MetadataNode const& node) {
        auto labels = labelsOn(node);
        std::erase_if(labels, [](LabelUUIDs const& uuids) { return uuids.second.empty(); });
        return labels;
    }

    void readCategories() {
        namespace categories = schema::categories;
        auto const head =
            MetadataPath::root().child(PathElement(categories::categoriesType, schema::rootLocation));
        for (auto const& child : childrenOf(head)) {
            if (child.element.getType() != categories::categoryType || !child.node) {
                continue;
            }
            auto& category = result_.categories[child.element.getLocation()];
            category.name = child.node->get(categories::categoryNameKey);
            category.isSingleValued =
                child.node->get(categories::categorySingleValuedKey) == categories::flagTrue;
            visit(childrenOf(head.child(child.element)), categories::labelType,
                  [&category](std::u16string const& uuid, MetadataNode const& node) {
                      category.labels[uuid] = node.get(categories::labelNameKey);
                  });
        }
    }

    void readEntryPoints() {
        namespace entrypoints = schema::entrypoints;
        visit(childrenOf(entrypoints::entryPointsType), entrypoints::entryPointType,
              [this](std::u16string const& uuid, MetadataNode const& node) {
                  result_.entryPoints[uuid] = {node.get(entrypoints::fileKey), node.get(entrypoints::nameKey),
                                               node.get(entrypoints::typeKey),
                                               node.get(entrypoints::groupUUIDKey),
                                               node.get(entrypoints::visibleKey) != entrypoints::hidden};
              });
        visit(childrenOf(entrypoints::groupsType), entrypoints::groupType,
              [this](std::u16string const& uuid, MetadataNode const& node) {
                  result_.groups[uuid] = node.get(entrypoints::groupNameKey);
              });
    }

    void readReferences(char16_t const* head, std::map<std::u16string, Definition::Reference>& to) const {
        visit(childrenOf(head), schema::references::referenceType,
              [&to](std::u16string const& uuid, MetadataNode const& node) {
                  to[uuid] = {node.get(schema::references::storedPathKey),
                              node.get(schema::references::typeKey)};
              });
    }

    ChildSource const& source_;
    std::vector<Folder> folders_; ///< from the root to the folder that is being read
    Definition result_;
};

} // namespace

Definition readDefinition(ChildSource const& source) {
    return DefinitionReader(source).read();
}

Definition readDefinition(OpenProject& project) {
    auto const guard = project.store().acquireReadLock();
    return readDefinition([&project](MetadataPath const& address, project::stores::ChildSink& children) {
        project.loadChildren(address, children);
    });
}

Definition readDefinition(std::string bytes, std::string const& file) {
    auto const text = project::stores::ProjectText::read(std::move(bytes), file);
    if (!text) {
        throw Failure(Message("ReportIncompleteText", file));
    }
    return readDefinition([&text](MetadataPath const& address, project::stores::ChildSink& children) {
        text->children(address, children);
    });
}

} // namespace projectctl

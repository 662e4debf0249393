#include "project/stores/Backend.hpp"

namespace project::stores {

void ChildCollector::add(LoadedChild const& child) {
    children_.push_back({{std::u16string(child.type), std::u16string(child.location)},
                         child.node,
                         child.isCreated,
                         child.hasChildren});
}

Children Backend::load(Address const& parent) {
    ChildCollector collector;
    load(parent, collector);
    return collector.take();
}

} // namespace project::stores

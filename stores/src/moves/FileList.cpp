#include "moves/FileList.hpp"

#include <algorithm>
#include <utility>

#include "project/metadata/TreeSchema.hpp"

namespace project::stores {

namespace schema = metadata::schema;

Address addressInList(std::u16string_view path) {
    std::vector<metadata::PathElement> steps{{schema::files::filesType, schema::files::fileListScope}};
    while (!path.empty()) {
        auto const end = std::min(path.find(u'/'), path.size());
        steps.emplace_back(schema::files::fileType, std::u16string(path.substr(0, end)));
        path.remove_prefix(std::min(end + 1, path.size()));
    }
    return Address(std::move(steps));
}

Address markerInList(std::u16string_view folder) {
    return addressInList(folder).child({schema::files::markerType, schema::files::markerLocation});
}

std::u16string pathInList(Address const& address) {
    std::u16string path;
    bool const isInList = address.depth() > 1 && address[0].getType() == schema::files::filesType &&
                          address[0].getLocation() == schema::files::fileListScope;
    for (std::size_t step = 1;
         isInList && step < address.depth() && address[step].getType() == schema::files::fileType; ++step) {
        path += path.empty() ? u"" : u"/";
        path += address[step].getLocation();
    }
    return path;
}

bool FileList::has(std::u16string_view path) const {
    return isAt(addressInList(path));
}

bool FileList::hasFolder(std::u16string_view path) const {
    return isAt(markerInList(path));
}

bool FileList::hasAnythingWithin(std::u16string_view path) const {
    return !body_->within(AddressText(addressInList(path)).view()).empty();
}

std::vector<std::u16string> FileList::pathsBelow(std::u16string const& folder) const {
    std::vector<std::u16string> result;
    auto const lines = body_->within(AddressText(addressInList(folder)).view());
    for (auto line = lines.begin; line < lines.end; ++line) {
        auto const address = toAddress(body_->address(line));
        auto const path = pathInList(address);
        bool const isOwn = address.leaf().getType() == schema::files::fileType;
        if (isOwn && path.size() > folder.size() + 1) {
            result.push_back(path.substr(folder.size() + 1));
        }
    }
    return result;
}

bool FileList::isAt(Address const& address) const {
    return body_->find(AddressText(address).view()).has_value();
}

} // namespace project::stores

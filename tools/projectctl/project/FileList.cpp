#include "project/FileList.hpp"

#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace fileSchema = project::metadata::schema::files;

FileList::FileList(OpenProject& project)
    : access_(project.access()), guard_(project.store().acquireReadLock()) {
}

FileList::Address FileList::below(Address const& address, std::u16string_view name) {
    return address.child(project::metadata::PathElement(fileSchema::fileType, std::u16string(name)));
}

void FileList::visit(Path const& path, Visitor const& visitor) const {
    project::session::Query query;
    query.paths.push_back(path);
    access_.visit(query, visitor);
}

} // namespace projectctl

#include "history/PathHistory.hpp"

namespace projectctl {

using project::stores::DefinitionChange;

namespace {

using Subject = DefinitionChange::Subject;

bool concernsPaths(Subject subject) {
    return subject == Subject::File || subject == Subject::FileLabel || subject == Subject::FileData ||
           subject == Subject::EntryPoint || subject == Subject::ProjectPath || subject == Subject::Reference;
}

} // namespace

std::vector<DefinitionChange> PathHistory::takeFrom(std::vector<DefinitionChange> const& changes) {
    std::vector<DefinitionChange> result;
    std::u16string earlier;
    for (auto const& change : changes) {
        bool const isRenamed = change.kind == DefinitionChange::Kind::Renamed;
        if (concernsPaths(change.subject) &&
            (isWithin(change.name) || (isRenamed && isWithin(change.earlier)))) {
            result.push_back(change);
        }
        bool const isFile = change.subject == DefinitionChange::Subject::File;
        if (isFile && isRenamed && change.name == path_) {
            earlier = change.earlier;
            result.back().isWithFolder = false;
        }
    }
    path_ = earlier.empty() ? path_ : earlier;
    return result;
}

bool PathHistory::isWithin(std::u16string const& path) const {
    return path_.empty() || path == path_ || path.starts_with(path_ + u'/');
}

} // namespace projectctl

#include "repository/WorkTreeRoot.hpp"

#include <filesystem>

#include "fl/filesystem/SystemName.hpp"

namespace project::git {

namespace {

/// An absolute name with single slashes and without one at the end; "." and ".." are resolved as text. "/"
/// becomes "".
std::string normalized(std::string_view name) {
    std::string result;
    result.reserve(name.size());
    while (!name.empty()) {
        std::size_t const length = std::min(name.find('/'), name.size());
        std::string_view const element = name.substr(0, length);
        if (element == "..") {
            result.resize(result.empty() ? 0 : result.rfind('/'));
        } else if (!element.empty() && element != ".") {
            result += '/';
            result += element;
        }
        name.remove_prefix(std::min(length + 1, name.size()));
    }
    return result;
}

bool isAtOrBelow(std::string const& name, std::string const& folder) {
    return name.starts_with(folder) && (name.size() == folder.size() || name[folder.size()] == '/');
}

} // namespace

TreePath parentOf(TreePath const& path) {
    std::size_t const slash = path.rfind('/');
    return slash == TreePath::npos ? TreePath() : path.substr(0, slash);
}

std::string_view nameOf(TreePath const& path) {
    return std::string_view(path).substr(path.rfind('/') + 1); // npos + 1 is 0
}

WorkTreeRoot::WorkTreeRoot(std::string const& workTree, fl::filesystem::Path const& projectRoot)
    : workTree_(normalized(workTree)) {
    fl::filesystem::SystemName const name(projectRoot);
    if (name.get() != nullptr) {
        std::error_code unresolvable;
        auto const real = std::filesystem::canonical(name.get(), unresolvable);
        givenRoot_ = normalized(name.get());
        realRoot_ = unresolvable ? givenRoot_ : normalized(real.native());
    }
}

std::optional<TreePath> WorkTreeRoot::relative(fl::filesystem::Path const& path) const {
    fl::filesystem::SystemName const bytes(path);
    if (bytes.get() == nullptr || *bytes.get() != '/') {
        return std::nullopt;
    }
    std::string name = normalized(bytes.get());
    if (givenRoot_ != realRoot_ && isAtOrBelow(name, givenRoot_)) {
        name.replace(0, givenRoot_.size(), realRoot_);
    }
    if (!isAtOrBelow(name, workTree_)) {
        return std::nullopt;
    }
    return name.substr(std::min(workTree_.size() + 1, name.size()));
}

std::optional<TreePath> WorkTreeRoot::relativeInProject(fl::filesystem::Path const& path) const {
    auto result = relative(path);
    return result && isAtOrBelow(onDisk(*result), realRoot_) ? result : std::nullopt;
}

} // namespace project::git

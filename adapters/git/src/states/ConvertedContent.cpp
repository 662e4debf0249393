#include "states/ConvertedContent.hpp"

#include <memory>

#include "repository/LibGit.hpp"

namespace project::git {

namespace {

using FilterHandle = std::unique_ptr<git_filter_list, FreedBy<&LibGitFunctions::git_filter_list_free>>;

} // namespace

std::optional<std::string> convertedContent(Repository const& repository, TreePath const& path,
                                            std::string const& content) {
    git_filter_list* filters = nullptr;
    if (libgit().git_filter_list_load(&filters, repository.get(), nullptr, path.c_str(), GIT_FILTER_TO_ODB,
                                      GIT_FILTER_DEFAULT) < 0) {
        return std::nullopt;
    }
    FilterHandle const owned(filters);
    git_buf converted = GIT_BUF_INIT;
    auto const code =
        libgit().git_filter_list_apply_to_buffer(&converted, filters, content.data(), content.size());
    std::string result(converted.ptr == nullptr ? "" : converted.ptr, converted.size);
    libgit().git_buf_dispose(&converted);
    return code < 0 ? std::nullopt : std::optional(std::move(result));
}

} // namespace project::git

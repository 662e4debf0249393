#include "git/Blobs.hpp"

#include <charconv>
#include <cstddef>
#include <string_view>

#include "git/GitCommand.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

/// Takes "<id> blob <size>\n<content>\n" from git's output.
/// @return false if it is anything else.
bool takeBlob(std::string_view& output, std::string_view id, std::string& content) {
    auto const end = output.find('\n');
    if (end == output.npos) {
        return false;
    }
    auto const head = output.substr(0, end);
    auto const start = std::string(id) + " blob ";
    std::size_t size = 0;
    bool const isRead =
        head.starts_with(start) &&
        std::from_chars(head.data() + start.size(), head.data() + head.size(), size).ec == std::errc();
    if (!isRead || output.size() < end + 1 + size + 1) {
        return false;
    }
    content = output.substr(end + 1, size);
    output.remove_prefix(end + 1 + size + 1);
    return true;
}

} // namespace

std::map<std::string, std::string> readBlobs(fl::filesystem::Path const& folder,
                                             std::set<std::string> const& ids) {
    std::map<std::string, std::string> result;
    std::string request;
    for (auto const& id : ids) {
        result[id];
        request += id.find_first_not_of('0') == id.npos ? "" : id + '\n';
    }
    if (request.empty()) {
        return result;
    }
    auto const answer = runGit(folder, {"cat-file", "--batch"}, request);
    std::string_view output = answer.output;
    for (auto& [id, content] : result) {
        bool const isNone = id.find_first_not_of('0') == id.npos;
        if (!isNone && !takeBlob(output, id, content)) {
            throw Failure(Message("GitContentMissing", id));
        }
    }
    return result;
}

} // namespace projectctl

#include "git/Blobs.hpp"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <optional>
#include <string_view>

#include "git/GitCommand.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

/// Takes a line, "<id> blob <size>", from git's output.
/// @return the size; nothing if the line is anything else, because the content is missing.
std::optional<std::size_t> takeHead(std::string_view& output, std::string_view id) {
    auto const end = std::min(output.find('\n'), output.size());
    auto const head = output.substr(0, end);
    auto const start = std::string(id) + " blob ";
    std::size_t size = 0;
    bool const isRead =
        head.starts_with(start) &&
        std::from_chars(head.data() + start.size(), head.data() + head.size(), size).ec == std::errc();
    output.remove_prefix(std::min(end + 1, output.size()));
    return isRead ? std::optional(size) : std::nullopt;
}

/// Takes "<id> blob <size>\n<content>\n" from git's output.
/// @return false if it is anything else.
bool takeBlob(std::string_view& output, std::string_view id, std::string& content) {
    auto const size = takeHead(output, id);
    if (!size || output.size() < *size + 1) {
        return false;
    }
    content = output.substr(0, *size);
    output.remove_prefix(*size + 1);
    return true;
}

bool isNone(std::string const& id) {
    return id.find_first_not_of('0') == id.npos;
}

/// The ids as git's batches expect them, one per line.
std::string requestFor(std::set<std::string> const& ids) {
    std::string result;
    for (auto const& id : ids) {
        result += isNone(id) ? "" : id + '\n';
    }
    return result;
}

} // namespace

std::map<std::string, std::string> readBlobs(fl::filesystem::Path const& folder,
                                             std::set<std::string> const& ids) {
    std::map<std::string, std::string> result;
    for (auto const& id : ids) {
        result[id];
    }
    auto const request = requestFor(ids);
    if (request.empty()) {
        return result;
    }
    auto const answer = runGit(folder, {"cat-file", "--batch"}, request);
    std::string_view output = answer.output;
    for (auto& [id, content] : result) {
        if (!isNone(id) && !takeBlob(output, id, content)) {
            throw Failure(Message("GitContentMissing", id));
        }
    }
    return result;
}

std::map<std::string, std::uint64_t> readBlobSizes(fl::filesystem::Path const& folder,
                                                   std::set<std::string> const& ids) {
    std::map<std::string, std::uint64_t> result;
    auto const request = requestFor(ids);
    if (request.empty()) {
        return result;
    }
    auto const answer = runGit(folder, {"cat-file", "--batch-check"}, request);
    std::string_view output = answer.output;
    for (auto const& id : ids) {
        auto const size = isNone(id) ? std::nullopt : takeHead(output, id);
        if (size) {
            result.emplace(id, *size);
        }
    }
    return result;
}

} // namespace projectctl

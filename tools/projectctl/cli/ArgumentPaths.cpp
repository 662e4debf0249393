#include "cli/ArgumentPaths.hpp"

#include <utility>

#include "output/Failure.hpp"

namespace projectctl {

ArgumentPaths::ArgumentPaths(Path from) : from_(std::move(from)) {
}

Path ArgumentPaths::absolute(std::string const& argument) {
    if (argument.empty()) {
        throw Failure(Message("EmptyPath"));
    }
    std::size_t const slash = argument.rfind('/');
    auto const last = slash == std::string::npos ? argument : argument.substr(slash + 1);
    if (last.empty() || last == "." || last == "..") {
        return resolved(argument);
    }
    auto const folder = slash == std::string::npos ? std::string() : argument.substr(0, slash + 1);
    return resolved(folder) / fl::filesystem::fromSystem(last);
}

Path const& ArgumentPaths::resolved(std::string const& folder) {
    auto [found, isNew] = resolved_.try_emplace(folder);
    if (isNew) {
        found->second =
            folder.empty() ? from_ : fl::filesystem::canonical(fl::filesystem::fromSystem(folder), from_);
    }
    return found->second;
}

} // namespace projectctl

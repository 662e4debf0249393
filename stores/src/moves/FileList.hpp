#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "text/TextBody.hpp"

namespace project::stores {

/// The address of a file or folder in the file list. @param path relative to the project's root.
Address addressInList(std::u16string_view path);

/// The address of the marker of a folder in the file list.
Address markerInList(std::u16string_view folder);

/// The path of an address in the file list, or of the file to which an address below it belongs; empty for
/// every other address.
std::u16string pathInList(Address const& address);

/// The file list that a body describes. Searches the lines for each question.
class FileList {
public:
    /// @param body must outlive this object.
    explicit FileList(TextBody const& body) : body_(&body) {}

    bool has(std::u16string_view path) const;
    bool hasFolder(std::u16string_view path) const;
    bool hasAnythingWithin(std::u16string_view path) const;

    /// The listed paths below a folder, relative to it.
    std::vector<std::u16string> pathsBelow(std::u16string const& folder) const;

private:
    bool isAt(Address const& address) const;

    TextBody const* body_;
};

} // namespace project::stores

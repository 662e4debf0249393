#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"
#include "project/labels/Label.hpp"

namespace project::management {

using fl::filesystem::Path;

/// A label on a file, with its data.
class PROJECT_MANAGEMENT_EXPORT FileLabel : public Label {
public:
    /// A label on a file.
    /// @param file absolute.
    /// @param data of the label on this file; empty if it has none.
    FileLabel(CategoryIdentifier category, LabelIdentifier labelIdentifier, Path file, std::u16string data);

    /// A label without data.
    FileLabel(CategoryIdentifier category, LabelIdentifier labelIdentifier, Path file);

    ~FileLabel() override;
    FileLabel(FileLabel const&) = default;
    FileLabel& operator=(FileLabel const&) = default;
    FileLabel(FileLabel&&) = default;
    FileLabel& operator=(FileLabel&&) = default;

    /// Returns the file that has the label, absolute.
    Path const& getFile() const { return file_; }

    /// Returns the label's data on this file; empty if it has none.
    std::u16string const& getData() const { return data_; }

private:
    Path file_;
    std::u16string data_;
};

} // namespace project::management

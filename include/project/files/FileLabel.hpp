#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"
#include "project/labels/Label.hpp"

namespace project::management {

using fl::filesystem::Path;

/// One label as it stands on one file, with its data there.
class PROJECT_MANAGEMENT_EXPORT FileLabel : public Label {
public:
    FileLabel(CategoryIdentifier category, LabelIdentifier labelIdentifier, Path file, std::u16string data);

    /// The same without data.
    FileLabel(CategoryIdentifier category, LabelIdentifier labelIdentifier, Path file);

    ~FileLabel() override;
    FileLabel(FileLabel const&) = default;
    FileLabel& operator=(FileLabel const&) = default;
    FileLabel(FileLabel&&) = default;
    FileLabel& operator=(FileLabel&&) = default;

    /// The file that bears the label.
    Path const& getFile() const { return file_; }

    /// The label's data on this file; empty when it has none.
    std::u16string const& getData() const { return data_; }

private:
    Path file_;
    std::u16string data_;
};

} // namespace project::management

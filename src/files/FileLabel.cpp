#include "project/files/FileLabel.hpp"

#include <utility>

namespace project::management {

FileLabel::FileLabel(CategoryIdentifier category, LabelIdentifier labelIdentifier, Path file,
                     std::u16string data)
    : Label(std::move(category), std::move(labelIdentifier)), file_(std::move(file)), data_(std::move(data)) {
}

FileLabel::FileLabel(CategoryIdentifier category, LabelIdentifier labelIdentifier, Path file)
    : FileLabel(std::move(category), std::move(labelIdentifier), std::move(file), std::u16string()) {
}

FileLabel::~FileLabel() = default;

} // namespace project::management

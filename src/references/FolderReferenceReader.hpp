#pragma once

#include <string>

#include "project/references/FolderReference.hpp"

namespace project::management {

/// The type of references that are stored as an absolute path: "Absolute".
std::u16string const& absoluteReferenceType();

/// The type of references that are stored relative to the project root: "Relative".
std::u16string const& relativeReferenceType();

/// Makes a reference again of what is stored of it. Each reader knows one type of reference.
///
/// Readers are immutable and may be used by several threads at once.
class FolderReferenceReader {
public:
    virtual ~FolderReferenceReader();

    /// True when this reader is the one for references of the type. Ask before read.
    virtual bool canRead(std::u16string const& type) const = 0;

    /// The reference with just this stored path and UUID. A folder that is gone is no error, nor is a disk
    /// that can't answer.
    virtual FolderReference read(std::u16string const& storedPath, std::u16string const& uuid) const = 0;
};

/// Reads absolute references. The location is the stored path as it is, and not its canonical form: it can
/// differ from that of the same reference when it was made.
class AbsoluteFolderReferenceReader : public FolderReferenceReader {
public:
    bool canRead(std::u16string const& type) const override;
    FolderReference read(std::u16string const& storedPath, std::u16string const& uuid) const override;
};

/// Reads relative references. The location is canonical where the disk can tell it, else the root with the
/// stored path appended.
class RelativeFolderReferenceReader : public FolderReferenceReader {
public:
    /// @param root the project root, from which stored paths lead.
    explicit RelativeFolderReferenceReader(Path root);

    bool canRead(std::u16string const& type) const override;
    FolderReference read(std::u16string const& storedPath, std::u16string const& uuid) const override;

private:
    Path root_;
};

} // namespace project::management

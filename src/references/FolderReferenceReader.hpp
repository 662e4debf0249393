#pragma once

#include <string>

#include "project/references/FolderReference.hpp"

namespace project::management {

/// Returns the type of references that are stored as an absolute path: "Absolute".
std::u16string const& absoluteReferenceType();

/// Returns the type of references that are stored relative to the project's root: "Relative".
std::u16string const& relativeReferenceType();

/// Creates references from their stored form. Each reader reads one type of reference.
///
/// Readers are immutable. Several threads may use one at the same time.
class FolderReferenceReader {
public:
    virtual ~FolderReferenceReader();

    /// Returns true if this reader reads references of the type. Must be called before read.
    virtual bool canRead(std::u16string const& type) const = 0;

    /// Returns the reference with this stored path and UUID. A folder that does not exist or cannot be
    /// accessed is not an error.
    virtual FolderReference read(std::u16string const& storedPath, std::u16string const& uuid) const = 0;
};

/// Reads absolute references. The location is the stored path, deliberately not in canonical form: it can
/// differ from the location of the reference when it was created.
class AbsoluteFolderReferenceReader : public FolderReferenceReader {
public:
    bool canRead(std::u16string const& type) const override;
    FolderReference read(std::u16string const& storedPath, std::u16string const& uuid) const override;
};

/// Reads relative references. The location is canonical if the disk can be accessed, else the root with the
/// stored path appended.
class RelativeFolderReferenceReader : public FolderReferenceReader {
public:
    /// @param root the project's root, to which stored paths are relative.
    explicit RelativeFolderReferenceReader(Path root);

    bool canRead(std::u16string const& type) const override;
    FolderReference read(std::u16string const& storedPath, std::u16string const& uuid) const override;

private:
    Path root_;
};

} // namespace project::management
